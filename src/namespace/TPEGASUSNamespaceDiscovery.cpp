// SPDX-License-Identifier: MIT
// Which providers are installed: one for each requested-class file in a vendor's directory.
#include "src/common/CoreLog.h"
#include "src/common/Directories.h"
#include "src/common/Files.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/provider/TPEGASUSProvider.h"
#include "src/provider/TPEGASUSRequestedClassParser.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>

#include <algorithm>
#include <cerrno>
#include <cstring>

namespace NKOLVRX20 {

namespace {

constexpr char kProviderType[] = "pegasus";
constexpr char kDiagnosticOnly[] = "YES";

std::vector<std::string> ReadDirectoryOrThrow(const std::string& path)
{
    std::vector<std::string> names;
    if (!ReadDirectory(path, names)) {
        const int error = errno;
        LogAndThrow(TVRXStatusCode::kDirectoryNotOpened, "TPEGASUSNamespace::FindXmlFiles failed: ", path, ": ",
                    std::strerror(error));
    }
    return names;
}

// Keeps the names of real subdirectories.
std::vector<std::string> SubDirectoriesAmong(const std::vector<std::string>& names, const std::string& directory)
{
    std::vector<std::string> subDirectories;
    for (const std::string& name : names) {
        if (name != "." && name != ".." && IsDirectory(directory + "/" + name)) {
            subDirectories.push_back(name);
        }
    }
    return subDirectories;
}

// Throws: TVRXException 4 when memory is short, or the file is larger than any requested-class file may be.
std::unique_ptr<char[]> AllocateFileBuffer(const std::string& path, std::size_t bytes)
{
    std::unique_ptr<char[]> buffer;
    if (bytes <= kMaxRequestedClassFileBytes) {
        buffer.reset(new (std::nothrow) char[bytes]);
    }
    if (!buffer) {
        LogAndThrow(TVRXStatusCode::kAllocationFailed, "TPEGASUSNamespace::parseProvider failed: ", path, ": ", bytes,
                    " bytes are more than ",
                    bytes > kMaxRequestedClassFileBytes ? "any such file may have" : "there is memory for");
    }
    return buffer;
}

} // namespace

void TPEGASUSNamespace::FindProviders()
{
    const std::string root = ModulePath() + kProviderDirectory;
    std::vector<std::string> paths = FindXmlFiles(root, kClassesExtension);
    LogProgress("TPEGASUSNamespace::Prefilter: ", paths.size(), " providers.");
    filterProviders(paths);
    LogProgress("TPEGASUSNamespace::Postfilter: ", paths.size(), " providers.");
    for (const std::string& path : paths) {
        try {
            prepareRegProvider(path);
        } catch (const TVRXException& exception) {
            LogFailure(exception.what());
        }
    }
    RegisterProviders();
}

std::vector<std::string> TPEGASUSNamespace::FindXmlFiles(const std::string& root, const std::string& extension)
{
    std::vector<std::string> paths;
    for (const std::string& vendor : SubDirectoriesAmong(ReadDirectoryOrThrow(root), root)) {
        const std::string directory = root + "/" + vendor;
        for (const std::string& name : ReadDirectoryOrThrow(directory)) {
            if (name.find(extension) != std::string::npos) {
                paths.push_back(directory + "/" + name);
            }
        }
    }
    std::sort(paths.begin(), paths.end());
    return paths;
}

// Unlike FindXmlFiles it gives an empty list for an unreadable directory: vendors are optional for the server.
std::vector<std::string> TPEGASUSNamespace::FindSubDirs(const std::string& directory)
{
    std::vector<std::string> names;
    ReadDirectory(directory, names);
    return SubDirectoriesAmong(names, directory);
}

void TPEGASUSNamespace::filterProviders(std::vector<std::string>&) {}

void TPEGASUSNamespace::parseProvider(const std::string& path, std::vector<std::string>& classes,
                                      std::map<std::string, std::string>& information)
{
    const std::size_t bytes = TOSSpecific::GetFileSize(path);
    const std::unique_ptr<char[]> buffer = AllocateFileBuffer(path, bytes);
    // The provider of an unreadable file is listed all the same, with an empty list of classes.
    TFile file = OpenRegularFile(path);
    if (!file) {
        return;
    }
    const std::size_t readBytes = std::fread(buffer.get(), 1, bytes, file.get());
    file.reset();
    {
        TPEGASUSRequestedClassParser parser;
        parser.Parse(buffer.get(), readBytes);
        classes = parser.GetRequestedClassData();
        information = parser.GetRequestedProInfoData();
    }
    std::string names;
    for (const std::string& name : classes) {
        names += name + " , ";
    }
    LogProgress("TPEGASUSNamespace::parseClasses collected for Class info = ", names, "\nNSP = ", information["nsp"],
                "\nDefault timeout = ", information["timeout"], "\nModule name = ", information["module"]);
}

// The path is the provider's identity: a second FindProviders adds only what is new on disk.
void TPEGASUSNamespace::prepareRegProvider(const std::string& path)
{
    const auto hasPath = [&path](const auto& provider) { return provider->GetPath() == path; };
    if (std::any_of(fProviders.begin(), fProviders.end(), hasPath)) {
        return;
    }
    LogProgress("Loading... ", path);
    const auto provider = boost::make_shared<TPEGASUSProvider>();
    provider->SetType(kProviderType);
    std::vector<std::string> classes;
    std::map<std::string, std::string> information;
    parseProvider(path, classes, information);
    provider->SetClassVector(classes);
    provider->SetDefaultTimeoutVal(information["timeout"]);
    provider->SetModuleName("lib" + information["module"]);
    provider->SetNameSpaceName(information["nsp"]);
    provider->SetPath(path);
    provider->SetName(information["module"]);
    provider->SetDescription(information["module"]);
    provider->SetDiagnosticOnly(information["diagnosticonly"] == kDiagnosticOnly);
    fProviders.push_back(provider);
    LogProgress("TPEGASUSNamespace created Provider ", path, "\n");
}

} // namespace NKOLVRX20
