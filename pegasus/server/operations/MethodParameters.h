// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMParamValue.h>

#include <cstddef>
#include <mutex>
#include <string>
#include <unordered_set>

namespace Pegasus::server {

// Log lines about parameters that clients send otherwise than the class declares them: each once, and at most
// kMaxWarnings in the life of a server, so that no client can fill the log or the memory.
//
// Thread: any.
class ParameterWarnings
{
  public:
    static constexpr std::size_t kMaxWarnings = 256;

    // `subject` says what the warning is about; a second warning about it is dropped.
    void give(const std::string& subject, const std::string& text);

  private:
    std::mutex fMutex;
    std::unordered_set<std::string> fSubjects;
};

// A method as its class declares it, to read a call's parameters by.
//
// Thread: one at a time.
class MethodDeclaration
{
  public:
    // `cimClass` includes inherited methods and the qualifiers of their parameters; its properties are unused.
    MethodDeclaration(const CIMConstClass& cimClass, const CIMName& method);

    // Returns: the parameters as the provider gets them. One that came untyped (PARAMTYPE is optional in DSP0201) is
    //     read as the declared type; the others, and undeclared ones, stay as sent.
    // Throws: CIM_ERR_METHOD_NOT_FOUND when a type is missing and the class lacks the method;
    //     CIM_ERR_TYPE_MISMATCH for an array where a scalar is declared and the other way round, and for a reference or
    //     an embedded object where another type is declared; CIM_ERR_INVALID_PARAMETER for a text whose
    //     conversion fails.
    Array<CIMParamValue> withTypes(const Array<CIMParamValue>& sent) const;

    // Warns of each parameter that is undeclared, or that came with another type than the declared one.
    void warnOfDifferences(const Array<CIMParamValue>& sent, ParameterWarnings& warnings) const;

  private:
    CIMConstParameter declared(const CIMParamValue& sent) const;
    CIMParamValue withType(const CIMParamValue& sent, const CIMConstParameter& declaration) const;
    std::string difference(const CIMParamValue& sent) const;

    std::string fName; // "Class.Method"
    CIMName fMethodName;
    CIMConstMethod fMethod; // uninitialized when the class does not declare it
};

} // namespace Pegasus::server
