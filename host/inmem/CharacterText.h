#ifndef VRX_CHARACTERTEXT_H
#define VRX_CHARACTERTEXT_H

#include <string>

#include <host/TCIMChar16.h>

namespace NKOLVRX20 {

// Returns: the code unit as one UTF-8 character; half of a surrogate pair, which is none, as U+FFFD.
std::string CharacterText(TCIMChar16 character);

} // namespace NKOLVRX20

#endif
