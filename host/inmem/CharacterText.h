#pragma once

#include <host/TCIMChar16.h>

#include <string>

namespace NKOLVRX20 {

// Returns: the code unit as one UTF-8 character; half of a surrogate pair, which is none, as U+FFFD.
std::string CharacterText(TCIMChar16 character);

} // namespace NKOLVRX20
