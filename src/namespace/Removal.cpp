// SPDX-License-Identifier: MIT
#include "src/namespace/Removal.h"

#include <algorithm>
#include <cstdlib>

namespace NKOLVRX20 {

namespace {

constexpr char kShellCharacters[] = " \"'\\`$&|;<>()*?[]{}!#~";

bool IsControl(char character)
{
    const auto byte = static_cast<unsigned char>(character);
    return byte < 0x20 || byte == 0x7F;
}

bool HasUnsafeCharacter(const std::string& text)
{
    return std::any_of(text.begin(), text.end(), IsControl) ||
           text.find_first_of(kShellCharacters) != std::string::npos;
}

} // namespace

// The shell's status is ignored: an absent file counts as removed.
void RemovePath(const std::string& path, const char* options)
{
    const std::string command = "rm " + path + " " + options + " > nul 2>&1";
    [[maybe_unused]] const int status = std::system(command.c_str());
}

bool IsSafeDirectory(const std::string& path)
{
    return !path.empty() && !HasUnsafeCharacter(path);
}

bool IsSafeNamePart(const std::string& name)
{
    return name.find('/') == std::string::npos && !HasUnsafeCharacter(name);
}

} // namespace NKOLVRX20
