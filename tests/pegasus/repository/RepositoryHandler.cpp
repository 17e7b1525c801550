// SPDX-License-Identifier: MIT
#include "tests/pegasus/repository/RepositoryHandler.h"

#include "pegasus/mof/MemoryHandler.h"
#include "tests/pegasus/mof/Describe.h"

#include <Pegasus/Common/Exception.h>

using namespace Pegasus;

namespace repository_test {

namespace {

mof::CompileOptions optionsFor(const char* nameSpace)
{
    mof::CompileOptions options;
    options.nameSpace = CIMNamespaceName(nameSpace);
    options.allowExperimental = true;
    return options;
}

// Keeps the last class; its superclass may be missing.
class Collector : public mof::MemoryHandler
{
  public:
    bool createClass(const CIMClass& newClass) override
    {
        last = newClass;
        return true;
    }

    CIMClass last;
};

} // namespace

void RepositoryHandler::useNamespace(const CIMNamespaceName& nameSpace)
{
    fNamespace = nameSpace;
    if (!fRepository.hasNamespace(nameSpace)) {
        fRepository.createNamespace(nameSpace);
    }
}

bool RepositoryHandler::findQualifier(const CIMName& name, CIMQualifierDecl& declaration)
{
    try {
        declaration = fRepository.getQualifier(fNamespace, name);
        return true;
    } catch (const CIMException&) {
        return false;
    }
}

bool RepositoryHandler::findClass(const CIMName& name, CIMClass& found)
{
    if (!fRepository.hasClass(fNamespace, name)) {
        return false;
    }
    repository::ClassOptions options;
    options.localOnly = false;
    options.includeClassOrigin = true;
    found = fRepository.getClass(fNamespace, name, options).clone();
    return true;
}

void RepositoryHandler::declareQualifier(const CIMQualifierDecl& declaration)
{
    fRepository.setQualifier(fNamespace, declaration);
}

bool RepositoryHandler::createClass(const CIMClass& newClass)
{
    fRepository.createClass(fNamespace, newClass);
    return true;
}

bool RepositoryHandler::createInstance(const CIMInstance& newInstance)
{
    fRepository.createInstance(fNamespace, newInstance);
    return true;
}

void compileText(repository::Repository& repository, const char* nameSpace, const std::string& text)
{
    RepositoryHandler handler(repository);
    mof::compileText(text, "t.mof", optionsFor(nameSpace), handler);
}

void compileFile(repository::Repository& repository, const char* nameSpace, const std::string& path)
{
    RepositoryHandler handler(repository);
    mof::compileFile(path, optionsFor(nameSpace), handler);
}

CIMClass parseClass(const std::string& declarations, const std::string& definition)
{
    Collector collector;
    mof::compileText(declarations + definition, "t.mof", optionsFor("root/any"), collector);
    return collector.last;
}

std::string failureOf(const std::function<void()>& operation)
{
    try {
        operation();
        return "no failure";
    } catch (const CIMException& error) {
        return std::to_string(error.getCode()) + " " + mof_test::utf8(error.getMessage());
    }
}

} // namespace repository_test
