// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>

namespace mof_test {

std::string utf8(const Pegasus::String& text);

// Return: one line, close to MOF, with everything that the definition has. A tilde precedes propagated elements; an at
// sign precedes a class origin.
std::string describe(const Pegasus::CIMConstQualifierDecl& declaration);
std::string describe(const Pegasus::CIMConstClass& cimClass);
std::string describe(const Pegasus::CIMConstInstance& instance);

} // namespace mof_test
