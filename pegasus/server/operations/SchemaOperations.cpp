// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/Operations.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server::operations {

namespace {

repository::ClassOptions classOptions(const CimRequest& request)
{
    repository::ClassOptions options;
    options.localOnly = request.parameters.boolean("LocalOnly", true);
    options.includeQualifiers = request.parameters.boolean("IncludeQualifiers", true);
    options.includeClassOrigin = request.parameters.boolean("IncludeClassOrigin", false);
    return options;
}

} // namespace

void getClass(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    repository::ClassOptions options = classOptions(request);
    options.propertyList = request.parameters.propertyList();
    answer.write(*core.repository.getClassText(request.nameSpace, request.parameters.className("ClassName"), options));
}

void enumerateClasses(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    const repository::ClassOptions options = classOptions(request);
    const CIMName className = request.parameters.optionalClassName("ClassName");
    const bool deep = request.parameters.boolean("DeepInheritance", false);
    std::string text;
    // Class by class, so that memory holds the text of one class at a time.
    for (const CIMName& name : core.repository.enumerateClassNames(request.nameSpace, className, deep)) {
        text.clear();
        wire::appendClass(text, core.repository.getClass(request.nameSpace, name, options));
        answer.write(text);
    }
}

void enumerateClassNames(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    std::string text;
    for (const CIMName& name :
         core.repository.enumerateClassNames(request.nameSpace, request.parameters.optionalClassName("ClassName"),
                                             request.parameters.boolean("DeepInheritance", false)))
    {
        wire::appendClassName(text, name);
    }
    if (!text.empty()) {
        answer.write(text);
    }
}

void createClass(ServerCore& core, const CimRequest& request, ElementSink&)
{
    core.repository.createClass(request.nameSpace, request.parameters.cimClass("NewClass"));
}

void getQualifier(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    std::string text;
    wire::appendQualifierDeclaration(
        text, core.repository.getQualifier(request.nameSpace, request.parameters.name("QualifierName")));
    answer.write(text);
}

void enumerateQualifiers(ServerCore& core, const CimRequest& request, ElementSink& answer)
{
    std::string text;
    for (const CIMQualifierDecl& declaration : core.repository.enumerateQualifiers(request.nameSpace)) {
        text.clear();
        wire::appendQualifierDeclaration(text, declaration);
        answer.write(text);
    }
}

void setQualifier(ServerCore& core, const CimRequest& request, ElementSink&)
{
    core.repository.setQualifier(request.nameSpace, request.parameters.qualifierDeclaration("QualifierDeclaration"));
}

} // namespace Pegasus::server::operations
