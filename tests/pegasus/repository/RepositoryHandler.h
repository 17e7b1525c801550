// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Compiler.h"
#include "pegasus/repository/Repository.h"

#include <functional>
#include <string>

namespace repository_test {

// Compiles MOF straight into a repository, as the server would for a client.
class RepositoryHandler : public Pegasus::mof::DefinitionHandler
{
  public:
    explicit RepositoryHandler(Pegasus::repository::Repository& repository) : fRepository(repository) {}

    void useNamespace(const Pegasus::CIMNamespaceName& nameSpace) override;
    bool findQualifier(const Pegasus::CIMName& name, Pegasus::CIMQualifierDecl& declaration) override;
    bool findClass(const Pegasus::CIMName& name, Pegasus::CIMClass& found) override;
    bool hasClass(const Pegasus::CIMName& name) override { return fRepository.hasClass(fNamespace, name); }
    void declareQualifier(const Pegasus::CIMQualifierDecl& declaration) override;
    bool createClass(const Pegasus::CIMClass& newClass) override;
    bool createInstance(const Pegasus::CIMInstance& newInstance) override;
    void warn(const std::string&, const std::string&) override {}

  private:
    Pegasus::repository::Repository& fRepository;
    Pegasus::CIMNamespaceName fNamespace;
};

// Create the namespace if it is missing.
// Throw: mof::MofError, Pegasus::Exception.
void compileText(Pegasus::repository::Repository& repository, const char* nameSpace, const std::string& text);
void compileFile(Pegasus::repository::Repository& repository, const char* nameSpace, const std::string& path);

// Returns: the one class that the definition declares, as a client would send it, after a check of its syntax only.
Pegasus::CIMClass parseClass(const std::string& declarations, const std::string& definition);

// Returns: "code message" of the operation's CIMException, or "no failure".
std::string failureOf(const std::function<void()>& operation);

} // namespace repository_test
