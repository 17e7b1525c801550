// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/DefinitionHandler.h"

#include <map>
#include <string>
#include <vector>

namespace Pegasus::mof {

// Keeps definitions in memory, one namespace at a time, for checking and comparing a file offline. Of CIM's
// rules it checks that superclasses exist.
class MemoryHandler : public DefinitionHandler
{
  public:
    void useNamespace(const CIMNamespaceName& nameSpace) override;
    bool findQualifier(const CIMName& name, CIMQualifierDecl& declaration) override;
    bool findClass(const CIMName& name, CIMClass& found) override;
    bool hasClass(const CIMName& name) override;
    void declareQualifier(const CIMQualifierDecl& declaration) override;
    bool createClass(const CIMClass& newClass) override;
    bool createInstance(const CIMInstance& newInstance) override;
    void warn(const std::string& place, const std::string& text) override;

    const std::map<std::string, CIMQualifierDecl>& qualifiers() const noexcept { return fQualifiers; }
    // As declared, in the order of the text.
    const std::vector<CIMClass>& classes() const noexcept { return fClasses; }
    const std::vector<CIMInstance>& instances() const noexcept { return fInstances; }
    // "place: warning: text"
    const std::vector<std::string>& warnings() const noexcept { return fWarnings; }

  private:
    std::map<std::string, CIMQualifierDecl> fQualifiers; // by lower-case name, as the next
    std::map<std::string, CIMClass> fWholeClasses;       // with inherited properties
    std::vector<CIMClass> fClasses;
    std::vector<CIMInstance> fInstances;
    std::vector<std::string> fWarnings;
};

} // namespace Pegasus::mof
