// SPDX-License-Identifier: MIT
#include "src/common/Directories.h"

#include <cstddef>

#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr std::size_t kRootPathBytes = 1024; // the final null included

} // namespace

// A function-local static: the library's initialiser writes it, in whatever order the sources are initialised.
std::string& ModulePath()
{
    static std::string fgModulePathName;
    return fgModulePathName;
}

std::string WorkingDirectory()
{
    char path[kRootPathBytes];
    return ::getcwd(path, sizeof path) ? path : "";
}

} // namespace NKOLVRX20
