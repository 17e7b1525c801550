#pragma once

#include <string>

namespace NKOLVRX20 {

inline constexpr char kRemoveTree[] = "-rf";
inline constexpr char kRemoveFile[] = "-f";

// Removes a file or a tree through the shell's rm. Its messages go to a file "nul" in the working directory; the
// command's form is part of what hosts rely on.
// Requires: a path that is safe in a shell command.
void RemovePath(const std::string& path, const char* options);

} // namespace NKOLVRX20
