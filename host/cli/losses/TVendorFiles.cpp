// SPDX-License-Identifier: MIT
#include "host/cli/losses/TVendorFiles.h"

#include "host/cli/model/Names.h"

#include <host/TXmlParser.h>

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

constexpr char kDefaultNamespace[] = "root/cimv2";
constexpr char kHiddenTag[] = "%^CDM^%";

class TClassListParser : public NKOLVRX20::TXmlParser
{
  public:
    explicit TClassListParser(TClassList& list) : fList(list) {}

    void StartElement(const char* name, std::map<std::string, std::string>& attributes) override
    {
        if (IsSame(name, "nsp")) {
            fList.fNamespace = attributes["name"];
        } else if (IsSame(name, "timeout")) {
            fList.fTimeoutSeconds = std::atoi(attributes["value"].c_str());
        } else if (IsSame(name, "module")) {
            fList.fModule = attributes["name"];
        } else if (IsSame(name, "class") && attributes["name"].find(kHiddenTag) == std::string::npos) {
            const std::string& entry = attributes["name"];
            fList.fClasses.push_back(entry.substr(0, std::min(entry.find('['), entry.find("%^"))));
            const std::size_t bracket = entry.find('[');
            if (bracket != std::string::npos) {
                fList.fClassTimeouts[fList.fClasses.back()] = std::atoi(entry.c_str() + bracket + 1);
            }
        }
    }
    void EndElement(const char*) override {}
    void processingInstruction(const char*, const char*) override {}
    void characters(const char*, unsigned int) override {}
    void notationDecl(const char*, const char*, const char*) override {}
    void FatalError(const char*) override {}

  private:
    TClassList& fList;
};

TClassList ReadClassList(const std::string& vendor, const std::string& path)
{
    TClassList list;
    list.fVendor = vendor;
    list.fPath = path;
    std::string text = ReadBeginning(path);
    TClassListParser(list).Parse(text.data(), text.size());
    if (list.fNamespace.empty()) {
        list.fNamespace = kDefaultNamespace;
    }
    return list;
}

template <typename Entry> void SortByName(std::vector<Entry>& entries, std::string Entry::*name)
{
    std::sort(entries.begin(), entries.end(),
              [name](const Entry& left, const Entry& right) { return left.*name < right.*name; });
}

} // namespace

std::string ReadBeginning(const std::string& path)
{
    std::string text(kMaxVendorFileBytes, '\0');
    std::ifstream file(path, std::ios::binary);
    file.read(text.data(), static_cast<std::streamsize>(text.size()));
    text.resize(static_cast<std::size_t>(file.gcount()));
    return text;
}

// The plug-in's own rules: two kinds of classes have timeouts of their own, whatever their vendors say.
int TClassList::TimeoutOf(const std::string& name) const
{
    constexpr int kDiagnosticServiceSeconds = 199;
    constexpr int kSoftwareIdentitySeconds = 301;
    constexpr int kDefaultSeconds = 60;
    if (name.find("AvailableDiagnosticService") != std::string::npos) {
        return kDiagnosticServiceSeconds;
    }
    if (name.find("SoftwareIdentity") != std::string::npos) {
        return kSoftwareIdentitySeconds;
    }
    const auto own = fClassTimeouts.find(name);
    const int seconds = own == fClassTimeouts.end() ? fTimeoutSeconds : own->second;
    return seconds > 0 ? seconds : kDefaultSeconds;
}

TVendorFiles::TVendorFiles(const std::string& providerDirectory)
{
    std::error_code error;
    for (const auto& folder : fs::directory_iterator(providerDirectory, error)) {
        if (!folder.is_directory(error)) {
            continue;
        }
        TVendorFolder found{folder.path().filename(), folder.path()};
        for (const auto& file : fs::directory_iterator(folder.path(), error)) {
            const std::string name = file.path().filename();
            const auto has = [&name](const char* part) { return name.find(part) != std::string::npos; };
            found.fHasDefinitions |= has(".properties.mof");
            found.fHasRegistration |= has(".registration.mof");
            if (has(".registration.mof")) {
                found.fRegistrations.push_back(file.path());
            }
            if (name.rfind("lib", 0) == 0 && has(".so")) {
                found.fHasLibrary = true;
                found.fLibraries.push_back(file.path());
            }
            if (has(".classes.xml") && file.is_regular_file(error)) {
                found.fHasClassList = true;
                fClassLists.push_back(ReadClassList(found.fName, file.path()));
            }
        }
        std::sort(found.fLibraries.begin(), found.fLibraries.end());
        fFolders.push_back(found);
    }
    SortByName(fFolders, &TVendorFolder::fName);
    SortByName(fClassLists, &TClassList::fPath);
}

const TClassList* TVendorFiles::FindClass(const std::string& name) const
{
    for (const TClassList& list : fClassLists) {
        for (const std::string& each : list.fClasses) {
            if (IsSame(each, name)) {
                return &list;
            }
        }
    }
    return nullptr;
}

const TVendorFolder* TVendorFiles::FindFolder(const std::string& name) const
{
    const auto found = std::find_if(fFolders.begin(), fFolders.end(),
                                    [&name](const TVendorFolder& folder) { return folder.fName == name; });
    return found == fFolders.end() ? nullptr : &*found;
}

const TClassList* TVendorFiles::FindOnlyList(const std::string& vendor) const
{
    const TClassList* found = nullptr;
    for (const TClassList& list : fClassLists) {
        if (list.fVendor == vendor) {
            if (found) {
                return nullptr;
            }
            found = &list;
        }
    }
    return found;
}

} // namespace vrxhost
