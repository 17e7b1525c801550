// SPDX-License-Identifier: MIT
#include "host/cli/record/TRecordParser.h"

#include "host/cli/model/NoContext.h"

#include <boost/make_shared.hpp>

#include <stdexcept>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

// Its path is the one that it was recorded with, whatever the class declares as keys.
class TRecordedInstance : public TInmemInstance
{
  public:
    using TInmemInstance::operator=;

    TRecordedInstance(const boost::shared_ptr<ICIMClass>& served, std::string path)
        : TInmemInstance(served, kNoContext), fPath(std::move(path))
    {
    }

    TCIMReference GetReference(TCIMContext) const override
    {
        TCIMReference reference;
        reference.SetPath(fPath);
        return reference;
    }

  private:
    const std::string fPath;
};

template <typename Pointer> const Pointer& Require(const Pointer& pointer, const char* what)
{
    if (!pointer) {
        throw std::runtime_error(std::string("no ") + what + " stands above");
    }
    return pointer;
}

} // namespace

TRecordParser::TRecordParser()
{
    fRecord.fNamespace = boost::make_shared<TInmemNamespace>();
}

const std::map<std::string, TRecordParser::THandler>& TRecordParser::Handlers()
{
    static const std::map<std::string, THandler> handlers = {
        {"host", &TRecordParser::AddHost},
        {"run", &TRecordParser::AddRun},
        {"class", &TRecordParser::AddClass},
        {"property", &TRecordParser::AddProperty},
        {"method", &TRecordParser::AddMethod},
        {"parameter", &TRecordParser::AddParameter},
        {"qualifier", &TRecordParser::AddQualifier},
        {"provider", &TRecordParser::AddProvider},
        {"serves", &TRecordParser::AddServes},
        {"instance", &TRecordParser::AddInstance},
        {"value", &TRecordParser::AddValue},
        {"served", &TRecordParser::AddServed},
        {"loss", &TRecordParser::AddLoss},
        {"about", &TRecordParser::AddAbout},
        {"log", &TRecordParser::AddLog},
        {"end", &TRecordParser::AddEnd},
    };
    return handlers;
}

void TRecordParser::Add(std::string_view line)
{
    TRecordFields fields(line);
    const std::string word = fields.Next();
    if (!fHasTitle) {
        if (word != kRecordTitle) {
            throw std::runtime_error("this is not a record of vrxhost");
        }
        return AddTitle(fields);
    }
    const auto handler = Handlers().find(word);
    if (fIsEnded || handler == Handlers().end()) {
        throw std::runtime_error(fIsEnded ? "a line stands after the end" : "a line begins with an unknown word");
    }
    (this->*handler->second)(fields);
    if (fields.HasMore()) {
        throw std::runtime_error("a line has more fields than it may have");
    }
}

void TRecordParser::AddTitle(TRecordFields& fields)
{
    const std::uint64_t version = fields.NextNumber();
    if (version != kRecordVersion) {
        throw std::runtime_error("the record has version " + std::to_string(version) + "; this program reads version " +
                                 std::to_string(kRecordVersion));
    }
    fHasTitle = true;
}

void TRecordParser::AddHost(TRecordFields& fields)
{
    for (std::string THostFacts::*fact :
         {&THostFacts::fName, &THostFacts::fMachineId, &THostFacts::fProduct, &THostFacts::fSerial})
    {
        fRecord.fHead.fHost.*fact = fields.Next();
    }
}

void TRecordParser::AddRun(TRecordFields& fields)
{
    fRecord.fHead.fRunId = fields.Next();
    fRecord.fHead.fStarted = fields.Next();
    fields.Next(); // the version of the program that wrote it, for people
}

template <typename Element> void TRecordParser::SetQualified(const boost::shared_ptr<Element>& element)
{
    fSetQualifier = [element](const std::string& name, const TCIMValue& value) { element->SetQualifier(name, value); };
}

void TRecordParser::AddClass(TRecordFields& fields)
{
    const std::string name = fields.Next();
    const std::string superName = fields.Next();
    const auto super = fRecord.fNamespace->GetClass(superName, kNoContext);
    const int depth = super ? fDepths[NormalizedName(superName)] + 1 : 0;
    if (fRecord.fNamespace->GetClass(name, kNoContext)) {
        throw std::runtime_error("class " + RecordField(name) + " is declared twice");
    }
    if (!super && !superName.empty()) {
        throw std::runtime_error("the superclass " + RecordField(superName) + " is not declared above");
    }
    if (depth > kMaxRecordedSuperclasses) {
        throw std::runtime_error("a class has more than " + std::to_string(kMaxRecordedSuperclasses) + " superclasses");
    }
    fDepths[NormalizedName(name)] = depth;
    fDeclared = boost::make_shared<TInmemClass>(name, super);
    fDeclared->SetNamespace(fRecord.fNamespace);
    fMethod.reset();
    SetQualified(fDeclared);
    fRecord.fNamespace->AddClass(fDeclared);
}

void TRecordParser::AddProperty(TRecordFields& fields)
{
    Require(fDeclared, "class");
    const std::string name = fields.Next();
    const TCIMValue::TCIMType type = fields.NextType();
    const bool isKey = fields.HasMore() && fields.Next() == "key";
    if (fDeclared->Has(name)) {
        throw std::runtime_error("property " + RecordField(name) + " is declared twice");
    }
    SetQualified(fDeclared->Declare(name, type, isKey));
}

void TRecordParser::AddMethod(TRecordFields& fields)
{
    const std::string name = fields.Next();
    fMethod = Require(fDeclared, "class")->DeclareMethod(name, fields.NextType());
    SetQualified(fMethod);
}

void TRecordParser::AddParameter(TRecordFields& fields)
{
    const std::string name = fields.Next();
    SetQualified(Require(fMethod, "method")->Declare(name, fields.NextType()));
}

void TRecordParser::AddQualifier(TRecordFields& fields)
{
    const std::string name = fields.Next();
    Require(fSetQualifier, "class")(name, fields.NextValue());
}

void TRecordParser::AddProvider(TRecordFields& fields)
{
    const std::string name = fields.Next();
    const std::string module = fields.Next();
    fProvider = boost::make_shared<TInmemProvider>(name, module, fields.Next());
    fServed.reset();
    fRecord.fNamespace->AddProvider(fProvider);
}

void TRecordParser::AddServes(TRecordFields& fields)
{
    const std::string name = fields.Next();
    const auto found = fRecord.fNamespace->GetClass(name, kNoContext);
    if (!found) {
        throw std::runtime_error("class " + RecordField(name) + " is not declared above");
    }
    Require(fProvider, "provider")->AddClass(found);
    fServed = boost::static_pointer_cast<TInmemClass>(found);
    fInstance.reset();
    fInstanceCount = 0;
}

void TRecordParser::AddInstance(TRecordFields& fields)
{
    fInstance = boost::make_shared<TRecordedInstance>(Require(fServed, "class that is served"), fields.Next());
    fServed->AddInstance(fInstance);
    ++fInstanceCount;
}

void TRecordParser::AddValue(TRecordFields& fields)
{
    const std::string name = fields.Next();
    try {
        Require(fInstance, "instance")->SetPropertyValue(name, fields.NextValue(), kNoContext);
    } catch (const TVRXException&) {
        throw std::runtime_error("\"" + RecordField(name.substr(0, 64)) + "\" is not the name of a property");
    }
}

void TRecordParser::AddServed(TRecordFields& fields)
{
    const std::uint64_t count = fields.NextNumber();
    Require(fServed, "class that is served");
    if (count != fInstanceCount) {
        throw std::runtime_error("the class had " + std::to_string(count) + " instances, and " +
                                 std::to_string(fInstanceCount) + " stand above");
    }
    fRecord.fMilliseconds[fServed->GetName(kNoContext)] = static_cast<long>(fields.NextNumber() & 0x7fffffff);
    fServed.reset();
    fInstance.reset();
}

void TRecordParser::AddLoss(TRecordFields& fields)
{
    TLoss loss;
    const std::string flags = fields.Next();
    const std::size_t kind = flags.find(kKindFlag);
    if (kind != std::string::npos) {
        const std::size_t word = kind + sizeof kKindFlag - 1;
        loss.fKind = KindOf(flags.substr(word, flags.find(' ', word) - word));
    }
    loss.fIsNote = flags.find("note ") != std::string::npos;
    loss.fIsCause = flags.find("cause ") != std::string::npos;
    loss.fIsConsequence = flags.find("consequence ") != std::string::npos;
    for (std::string TLoss::*text : {&TLoss::fBegin, &TLoss::fEnd, &TLoss::fVendor, &TLoss::fFile, &TLoss::fProperty}) {
        loss.*text = fields.Next();
    }
    fRecord.fLosses.push_back(std::move(loss));
}

void TRecordParser::AddAbout(TRecordFields& fields)
{
    static const std::map<std::string, std::vector<std::string> TLoss::*> lists = {
        {"object", &TLoss::fObjects}, {"class", &TLoss::fClasses}, {"log", &TLoss::fLog}};
    const std::string kind = fields.Next();
    const auto list = lists.find(kind);
    const bool isProvider = kind == "provider";
    if (fRecord.fLosses.empty() || (list == lists.end() && !isProvider)) {
        throw std::runtime_error("a detail of a loss stands alone or is of an unknown kind");
    }
    TLoss& loss = fRecord.fLosses.back();
    if (isProvider) {
        loss.fProvider = fields.Next();
    } else {
        (loss.*list->second).push_back(fields.Next());
    }
}

void TRecordParser::AddLog(TRecordFields& fields)
{
    fRecord.fLog.push_back(fields.Next());
}

void TRecordParser::AddEnd(TRecordFields& fields)
{
    fRecord.fIsComplete = fields.Next() == "complete";
    fRecord.fHead.fEnded = fields.Next();
    fields.Next(); // the sum
    if (fServed) {
        throw std::runtime_error("the instances of class " + RecordField(fServed->GetName(kNoContext)) +
                                 " are not closed");
    }
    fIsEnded = true;
}

} // namespace vrxhost
