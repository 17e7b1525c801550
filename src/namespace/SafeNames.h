// Which names may stand in a removal command. Those commands go through a shell and end in "-rf", with the names in
// them to the letter: a blank or a star could delete something else.
#pragma once

#include <string>

namespace NKOLVRX20 {

// Returns: false for the empty name, and for one with a control byte, a blank or a character special to a shell.
bool IsSafeDirectory(const std::string& path);

// The same for a part of a file name, which holds no slash either, and may be empty.
bool IsSafeNamePart(const std::string& name);

} // namespace NKOLVRX20
