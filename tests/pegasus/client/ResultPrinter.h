// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>

#include <string>

namespace test {

// Results as the program printed them that made the recordings; each line feed stands for its " | ".

std::string printClass(const Pegasus::CIMClass& cimClass);
std::string printInstances(const Pegasus::Array<Pegasus::CIMInstance>& instances);
std::string printInstanceSummary(const Pegasus::CIMInstance& instance);
std::string printPaths(const Pegasus::Array<Pegasus::CIMObjectPath>& paths);
std::string printNames(const Pegasus::Array<Pegasus::CIMName>& names);
std::string printQualifier(const Pegasus::CIMQualifierDecl& declaration);
std::string printQualifiers(const Pegasus::Array<Pegasus::CIMQualifierDecl>& declarations);
std::string printMethodResult(const Pegasus::CIMValue& result, const Pegasus::Array<Pegasus::CIMParamValue>& outputs);
// "EXC Pegasus::CIMException code=6 msg=..."
std::string printException(const Pegasus::Exception& exception);

} // namespace test
