#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>

namespace mof_test {

std::string utf8(const Pegasus::String& text);

// One line each, close to MOF, with everything that a definition says and nothing else. What is marked propagated has
// a tilde in front, a class origin stands behind an at sign.
std::string describe(const Pegasus::CIMConstQualifierDecl& declaration);
std::string describe(const Pegasus::CIMConstClass& cimClass);
std::string describe(const Pegasus::CIMConstInstance& instance);

} // namespace mof_test
