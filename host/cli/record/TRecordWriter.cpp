// SPDX-License-Identifier: MIT
#include "host/cli/record/TRecordWriter.h"

#include "host/cli/model/NoContext.h"
#include "host/inmem/TInmemProperty.h"

#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>

#include <cerrno>
#include <cstring>
#include <fstream>
#include <stdexcept>

#include <fcntl.h>
#include <unistd.h>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

constexpr std::size_t kSumIntervalBytes = 64u << 10;
constexpr std::size_t kReservedBytes = 32u << 20; // of a record's limit, for losses and the log

template <typename... Fields> std::string Line(const char* word, const Fields&... fields)
{
    std::string line = word;
    ((line += "\t" + RecordField(fields)), ...);
    return line + "\n";
}

std::string ValueLine(const char* word, const std::string& name, const TCIMValue& value)
{
    return std::string(word) + "\t" + RecordField(name) + "\t" + RecordValue(value) + "\n";
}

std::string TypeText(TCIMValue::TCIMType type)
{
    return std::string(type.GetName()) + (type.IsArray() ? "[]" : "");
}

std::string QualifierLines(const ICIMNamedElement& element)
{
    std::string lines;
    element.EnumerateQualifiers(
        [&lines](boost::shared_ptr<ICIMQualifier> qualifier) {
            lines += ValueLine("qualifier", qualifier->GetName(kNoContext), qualifier->GetValue(kNoContext));
            return true;
        },
        kNoContext);
    return lines;
}

std::set<std::string> KeyNames(const ICIMClass& each)
{
    std::set<std::string> keys;
    each.EnumerateKeyNames([&keys](const std::string* name) { return keys.insert(*name), true; }, kNoContext);
    return keys;
}

std::string PropertyLines(const ICIMPropertyDecl& property, const std::set<std::string>& keys)
{
    const std::string name = property.GetName(kNoContext);
    const std::string type = TypeText(property.GetType(kNoContext));
    return (keys.count(name) != 0 ? Line("property", name, type, std::string("key")) : Line("property", name, type)) +
           QualifierLines(property);
}

std::string MethodLines(const ICIMMethodDecl& method)
{
    std::string lines =
        Line("method", method.GetName(kNoContext), TypeText(method.GetReturnType(kNoContext))) + QualifierLines(method);
    method.EnumerateParameterDecls(
        [&lines](boost::shared_ptr<ICIMParameterDecl> parameter) {
            lines += Line("parameter", parameter->GetName(kNoContext), TypeText(parameter->GetType(kNoContext))) +
                     QualifierLines(*parameter);
            return true;
        },
        kNoContext);
    return lines;
}

[[noreturn]] void ThrowErrno(const std::string& path)
{
    throw std::runtime_error("the record " + path + " could not be written: " + std::strerror(errno));
}

} // namespace

TRecordWriter::TRecordWriter(const std::string& path, const TDocumentHead& head)
    : fPath(path), fTemporaryPath(path + "." + head.fRunId + ".part")
{
    constexpr mode_t kOwnerOnly = 0600;
    const int file = ::open(fTemporaryPath.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, kOwnerOnly);
    if (file < 0) {
        ThrowErrno(fPath);
    }
    fFile.reset(::fdopen(file, "w"));
    Write(Line(kRecordTitle, std::to_string(kRecordVersion)));
    Write(Line("host", head.fHost.fName, head.fHost.fMachineId, head.fHost.fProduct, head.fHost.fSerial));
    Write(Line("run", head.fRunId, head.fStarted, std::string(VRX_VERSION)));
}

TRecordWriter::~TRecordWriter()
{
    if (fFile) {
        ::unlink(fTemporaryPath.c_str());
    }
}

void TRecordWriter::BeginProvider(const TProviderRecord& provider)
{
    Write(Line("provider", provider.fName, provider.fModule, provider.fDescription));
}

void TRecordWriter::BeginClass(ICIMClass& each, const TClassRecord& record)
{
    try {
        Declare(each, record.fName, 0);
    } catch (...) {
        Write(Line("serves", record.fName));
        throw;
    }
    Write(Line("serves", record.fName));
}

// From the top of the hierarchy down, so that a reader knows the superclass. The class has its line also when a class
// above it or one of its elements cannot be read.
void TRecordWriter::Declare(ICIMClass& each, const std::string& name, int depth)
{
    if (!fDeclared.insert(name).second) {
        return;
    }
    std::string superName;
    try {
        const auto super = depth < kMaxRecordedSuperclasses ? each.GetSuperClass(kNoContext) : nullptr;
        if (super && !super->IsRootClass(kNoContext)) {
            superName = super->GetName(kNoContext);
            Declare(*super, superName, depth + 1);
        }
    } catch (...) {
        Write(Line("class", name, superName));
        throw;
    }
    Write(Line("class", name, superName));
    Write(QualifierLines(each));
    const auto keys = KeyNames(each);
    each.EnumeratePropertyDecls(
        [&](boost::shared_ptr<ICIMPropertyDecl> property) { return Write(PropertyLines(*property, keys)), true; },
        kNoContext);
    each.EnumerateMethodDecls(
        [&](boost::shared_ptr<ICIMMethodDecl> method) { return Write(MethodLines(*method)), true; }, kNoContext);
}

void TRecordWriter::Add(const ICIMInstance& instance)
{
    std::string lines = Line("instance", instance.BuildPath(kNoContext).GetPath());
    instance.EnumerateProperties(
        [&lines](boost::shared_ptr<ICIMProperty> property) {
            const std::string line =
                ValueLine("value", TInmemProperty::NameOf(*property), property->GetValue(kNoContext));
            if (line.size() > kMaxRecordLineBytes) {
                throw std::length_error("a value of " + std::to_string(line.size()) +
                                        " bytes is larger than a record can hold");
            }
            lines += line;
            return true;
        },
        kNoContext);
    if (fBytes + lines.size() > kMaxRecordBytes - kReservedBytes) {
        throw std::length_error("the record has grown to its limit of " + std::to_string(kMaxRecordBytes >> 20) +
                                " MiB");
    }
    Write(lines);
}

void TRecordWriter::EndClass(const TClassRecord& record)
{
    Write(Line("served", std::to_string(record.fInstanceCount), std::to_string(record.fMilliseconds)));
}

void TRecordWriter::Finish(const TDocument& document)
{
    for (const TLoss& loss : document.fLosses) {
        WriteLoss(loss);
    }
    WriteLog(document.fLogFile);
    std::string line = Line("end", std::string(document.fComplete ? "complete" : "partial"), document.fHead.fEnded);
    line.pop_back();
    Write(line + "\t");
    const std::string sum = fSum.GetText() + "\n";
    Write(sum);
    const bool isWritten = std::fflush(fFile.get()) == 0 && !std::ferror(fFile.get()) &&
                           ::fsync(::fileno(fFile.get())) == 0 &&
                           std::rename(fTemporaryPath.c_str(), fPath.c_str()) == 0;
    if (!isWritten) {
        ThrowErrno(fPath); // the destructor removes the file
    }
    fFile.reset();
}

void TRecordWriter::WriteLoss(const TLoss& loss)
{
    const std::string flags = std::string(loss.fIsNote ? "note " : "") + (loss.fIsCause ? "cause " : "") +
                              (loss.fIsConsequence ? "consequence " : "") + kKindFlag + WordOf(loss.fKind) + " ";
    Write(Line("loss", flags, loss.fBegin, loss.fEnd, loss.fVendor, loss.fFile, loss.fProperty));
    if (!loss.fProvider.empty()) {
        Write(Line("about", std::string("provider"), loss.fProvider));
    }
    const std::pair<const char*, const std::vector<std::string>&> lists[] = {
        {"object", loss.fObjects}, {"class", loss.fClasses}, {"log", loss.fLog}};
    for (const auto& [kind, texts] : lists) {
        for (const std::string& text : texts) {
            Write(Line("about", std::string(kind), text));
        }
    }
}

void TRecordWriter::WriteLog(const std::string& path)
{
    std::ifstream log(path, std::ios::binary | std::ios::ate);
    const std::streamoff size = log ? static_cast<std::streamoff>(log.tellg()) : 0;
    constexpr std::streamoff kMax = kMaxLogBytes;
    log.seekg(size > kMax ? size - kMax : 0);
    std::size_t written = 0; // escapes may make a line longer
    for (std::string text; written < kMaxLogBytes && std::getline(log, text);) {
        const std::string line = Line("log", text.substr(0, kMaxRecordLineBytes / 8));
        written += line.size();
        Write(line);
    }
}

void TRecordWriter::Write(const std::string& lines)
{
    std::fwrite(lines.data(), 1, lines.size(), fFile.get()); // Finish asks for errors
    fSum.Add(lines);
    fBytes += lines.size();
    if (fBytes - fBytesOfSum >= kSumIntervalBytes && !lines.empty() && lines.back() == '\n') {
        fBytesOfSum = fBytes;
        const std::string line = Line("sum", fSum.GetText());
        std::fwrite(line.data(), 1, line.size(), fFile.get());
        fSum.Add(line);
        fBytes += line.size();
    }
}

} // namespace vrxhost
