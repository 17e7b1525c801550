// SPDX-License-Identifier: MIT
// The human-readable text of a value whose declaration lacks one.
#pragma once

#include <host/TCIMValue.h>

#include <optional>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// Requires: a scalar.
// Returns: a datetime as ToUIString, a char16 as CharacterText, every other value as ToString(10); null as empty text.
std::string PlainText(const TCIMValue& value);

// Returns: true for integers and reals that are not null, and for arrays of them.
bool IsNumber(const TCIMValue& value);

// Returns: the code unit as one UTF-8 character. An unpaired surrogate becomes U+FFFD.
std::string CharacterText(TCIMChar16 character);

// Returns: the texts in order, with the separator between them.
std::string JoinTexts(const std::vector<std::string>& texts, const char* separator);

// A number in the unit that suits its size: bytes in powers of 1024 ("23.5 GiB"), rates and frequencies in powers of
// 1000
// ("10 Gbit/s", "2.1 GHz").
// unit: as the qualifier Units or PUnit has it.
// Returns: nothing for other units, texts, arrays and nulls.
std::optional<std::string> Magnitude(const TCIMValue& value, const std::string& unit);

// Returns: an integer's digits in groups of three from five digits on, "1,376,331"; other texts as they are.
std::string GroupedDigits(const std::string& number);

} // namespace NKOLVRX20
