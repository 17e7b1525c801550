// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>

namespace vrxhost {

// One *.classes.xml: what a provider is asked for.
struct TClassList
{
    std::string fVendor; // the folder's name
    std::string fPath;
    std::string fModule;
    std::string fNamespace;
    std::vector<std::string> fClasses; // names alone, without those that are tagged as hidden from hosts
    int fTimeoutSeconds = 0;           // of classes without a timeout of their own; 0: the plug-in's default
    std::map<std::string, int> fClassTimeouts;

    // Returns: seconds that the plug-in waits for the instances of the class.
    int TimeoutOf(const std::string& name) const;
};

// One folder below the provider directory.
struct TVendorFolder
{
    std::string fName;
    std::string fPath;
    bool fHasClassList = false;
    bool fHasDefinitions = false;  // *.properties.mof
    bool fHasRegistration = false; // *.registration.mof
    bool fHasLibrary = false;
    std::vector<std::string> fLibraries = {};     // paths of lib*.so*
    std::vector<std::string> fRegistrations = {}; // paths of *.registration.mof
};

// Returns: a file's text, cut after kMaxVendorFileBytes; empty for one that cannot be read.
std::string ReadBeginning(const std::string& path);

constexpr std::size_t kMaxVendorFileBytes = 1024 * 1024;

// What the vendors' folders hold, read from the disk as the plug-in reads it (docs/vendors.md). What cannot be read is
// left out: the plug-in reports it.
class TVendorFiles
{
  public:
    TVendorFiles() = default;
    explicit TVendorFiles(const std::string& providerDirectory);

    const std::vector<TVendorFolder>& GetFolders() const { return fFolders; }
    const std::vector<TClassList>& GetClassLists() const { return fClassLists; }

    // Returns: the list that names the class (letter case ignored); null for an unlisted class.
    const TClassList* FindClass(const std::string& name) const;
    const TVendorFolder* FindFolder(const std::string& name) const;
    // Returns: the one list of the vendor; null for none and for several.
    const TClassList* FindOnlyList(const std::string& vendor) const;

  private:
    std::vector<TVendorFolder> fFolders; // in the order of their names
    std::vector<TClassList> fClassLists;
};

} // namespace vrxhost
