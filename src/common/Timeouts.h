// The timeouts that a vendor's *.classes.xml gives as texts.
#pragma once

#include <string>

namespace NKOLVRX20 {

// Returns: the text's leading number of seconds in milliseconds. The product wraps at 32 bits; a text that lacks a
// leading number gives 0.
unsigned int MillisecondsFromText(const std::string& seconds);

// Returns: whether the text is a number of seconds, and its milliseconds fit into 32 bits.
bool IsPlainTimeout(const std::string& seconds);

} // namespace NKOLVRX20
