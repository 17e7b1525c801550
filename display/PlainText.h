// The human-readable text of a value whose declaration lacks one.
#pragma once

#include <host/TCIMValue.h>

#include <string>
#include <vector>

namespace NKOLVRX20 {

// Requires: a scalar.
// Returns: a datetime as ToUIString, a char16 as CharacterText, every other value as ToString(10); null as empty text.
std::string PlainText(const TCIMValue& value);

// Returns: the code unit as one UTF-8 character. An unpaired surrogate becomes U+FFFD.
std::string CharacterText(TCIMChar16 character);

// Returns: the texts in order, with the separator between them.
std::string JoinTexts(const std::vector<std::string>& texts, const char* separator);

} // namespace NKOLVRX20
