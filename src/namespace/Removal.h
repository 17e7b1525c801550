// SPDX-License-Identifier: MIT
// Removing files through a shell, and which names may stand in such a command. The commands end in "-rf" and hold the
// names to the letter: a blank or a star could delete something else.
#pragma once

#include <string>

namespace NKOLVRX20 {

inline constexpr char kRemoveTree[] = "-rf";
inline constexpr char kRemoveFile[] = "-f";

// Removes a file or a tree through the shell's rm. Its messages go to a file "nul" in the working directory; the
// command's form is part of what hosts rely on.
// Requires: a path that is safe in a shell command.
void RemovePath(const std::string& path, const char* options);

// Returns: false for the empty name, and for one with a control byte, a blank or a character special to a shell.
bool IsSafeDirectory(const std::string& path);

// The same for a part of a file name, in which a slash is refused too, and which may be empty.
bool IsSafeNamePart(const std::string& name);

} // namespace NKOLVRX20
