// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlText.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

namespace Pegasus::wire {

// Objects to CIM-XML elements (DSP0201): each function appends to `out` the element that its comment names,
// UTF-8, a line feed after every tag that ends a line. Throws: UninitializedObjectException.

// CLASS
void appendClass(std::string& out, const CIMConstClass& cimClass);
// INSTANCE
void appendInstance(std::string& out, const CIMConstInstance& instance, Blanks blanks = Blanks::kReferences);
// VALUE.NAMEDINSTANCE, from the instance's path and the instance
void appendNamedInstance(std::string& out, const CIMConstInstance& instance, Blanks blanks = Blanks::kReferences);
// The start tag of INSTANCE
void appendInstanceStart(std::string& out, const CIMName& className);
// QUALIFIER.DECLARATION
void appendQualifierDeclaration(std::string& out, const CIMConstQualifierDecl& declaration);
// PROPERTY, PROPERTY.ARRAY or PROPERTY.REFERENCE
void appendProperty(std::string& out, const CIMConstProperty& property, Blanks blanks = Blanks::kReferences);
// Its start tag
void appendPropertyStart(std::string& out, const CIMConstProperty& property);

// CLASSNAME
void appendClassName(std::string& out, const CIMName& className);
// The start tag of INSTANCENAME
void appendInstanceNameStart(std::string& out, const CIMName& className);
// The start tags of KEYBINDING and KEYVALUE. Requires: another type than REFERENCE.
void appendKeyStart(std::string& out, const CIMName& name, CIMKeyBinding::Type type);
// INSTANCENAME
void appendInstanceName(std::string& out, const CIMObjectPath& path, Blanks blanks = Blanks::kReferences);
// LOCALINSTANCEPATH: namespace and INSTANCENAME
void appendLocalInstancePath(std::string& out, const CIMNamespaceName& nameSpace, const CIMObjectPath& path);
// LOCALCLASSPATH: namespace and CLASSNAME
void appendLocalClassPath(std::string& out, const CIMNamespaceName& nameSpace, const CIMName& className);
// LOCALNAMESPACEPATH
void appendLocalNamespacePath(std::string& out, const CIMNamespaceName& nameSpace);
// VALUE.REFERENCE, with as much of the path as it has
void appendReference(std::string& out, const CIMObjectPath& path);

// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY; a null is left out.
void appendValue(std::string& out, const CIMValue& value, Blanks blanks = Blanks::kReferences);
// PARAMVALUE
void appendParamValue(std::string& out, const CIMParamValue& parameter);
// RETURNVALUE
void appendReturnValue(std::string& out, const CIMValue& value);

} // namespace Pegasus::wire
