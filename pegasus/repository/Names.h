#pragma once

#include <Pegasus/Common/CIMName.h>

#include <string>

namespace Pegasus::repository {

// ASCII letters in lower case: equal names have equal folded texts.
std::string foldCase(std::string text);
std::string folded(const CIMName& name);
std::string folded(const CIMNamespaceName& name);

// An integer in decimal, without sign of a zero, however it was written; any other text as it is.
std::string canonicalNumber(const std::string& text);

} // namespace Pegasus::repository
