#pragma once

#include <Pegasus/Common/CIMClass.h>

// MOF declares a property that holds an embedded object as a string with a qualifier; the CIM-XML decoder makes it an
// object or an instance. The repository uses the types in which OpenPegasus returns such properties: a scalar with
// EmbeddedInstance is an instance, every other one stays a string.
namespace Pegasus::repository {

// Returns: the type for a property as declared.
CIMType embeddedType(const CIMConstProperty& property);

// Returns: the property's value with that type; null when its default has another type.
CIMValue embeddedValue(const CIMConstProperty& property);

// Returns: a decoded class with these types in place of the decoder's.
CIMClass withEmbeddedTypes(CIMClass decoded);

// Returns: true when the given value may be stored in the declared property.
bool isStorableAs(const CIMConstProperty& given, const CIMConstProperty& declared);

} // namespace Pegasus::repository
