// SPDX-License-Identifier: MIT
// A host that loads the plug-in of one tree after the other's.
//
//   two_trees (ROOT CONSUMER)...
//
// Prints for each tree how many instances it has and which client library served it. The exit status is 1 when a
// library of a tree stays in the process after the plug-in has been unloaded.
#include "host/cli/TSession.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/IProvider.h>

#include <filesystem>
#include <fstream>
#include <iostream>
#include <set>

using namespace NKOLVRX20;

namespace {

int CountInstances(ICIMNamespace& nameSpace)
{
    int count = 0;
    const auto countOne = [&](boost::shared_ptr<ICIMInstance>) { return ++count, true; };
    const auto ofClass = [&](boost::shared_ptr<ICIMClass> offered) {
        offered->EnumerateInstances(countOne, true, {});
        return true;
    };
    const auto ofProvider = [&](boost::shared_ptr<IProvider> provider) {
        provider->EnumerateClassesProvided(ofClass, {});
        return true;
    };
    nameSpace.EnumerateProviders(ofProvider, {});
    return count;
}

// The files in the process whose path holds a text.
std::set<std::string> MappedFiles(const std::string& part)
{
    std::set<std::string> files;
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        if (line.find(part) != std::string::npos) {
            files.insert(line.substr(line.find('/')));
        }
    }
    return files;
}

std::string UseTree(const std::string& root, const std::string& consumer)
{
    vrxhost::TSession session(root + "/libpegasus.nsp.so", consumer);
    session.Open();
    std::cout << CountInstances(session.GetNamespace());
    for (const std::string& file : MappedFiles("libpegclient")) {
        std::cout << ' ' << file;
    }
    std::cout << std::endl;
    return session.Close();
}

} // namespace

int main(int argc, char** argv)
{
    for (int i = 1; i + 1 < argc; i += 2) {
        const std::string root = argv[i];
        std::filesystem::current_path(root);
        std::string fault = UseTree(root, argv[i + 1]);
        for (const std::string& file : MappedFiles(root)) {
            fault += " " + file + " is still mapped.";
        }
        if (!fault.empty()) {
            std::cerr << fault << std::endl;
            return 1;
        }
    }
    return 0;
}
