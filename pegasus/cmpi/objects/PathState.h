// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ProviderValue.h"
#include "pegasus/cmpi/services/ClassSchema.h"

#include <Pegasus/Common/CIMObjectPath.h>

#include <string_view>
#include <vector>

namespace Pegasus::cmpi {

class Broker;

struct PathKey
{
    CIMName name;
    ProviderValue value; // not null
};

// What a CMPIObjectPath and the path of a CMPIInstance hold: the parts of a path, its keys as typed values. The class
// need not exist: providers make paths to classes of other servers.
struct PathState
{
    // A null or empty text leaves that part unset.
    // Throws: CMPI_RC_ERR_INVALID_PARAMETER for an illegal namespace or class name.
    PathState(Broker& broker, const char* nameSpace, const char* className);
    // Keys take the types that the class declares; values that differ from it, and those of an unknown class, keep
    // their own.
    PathState(Broker& broker, const CIMObjectPath& path);

    // Replaces the key of that name; a null value removes it. A name other than a key of the class is taken and logged.
    // Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for arrays, instances and untyped nulls.
    void addKey(const char* name, const CMPIValue* value, CMPIType type);
    // Returns: the key of that name (case-insensitive), or null.
    const PathKey* findKey(std::string_view name) const;
    const PathKey* findKey(const CIMName& name) const;
    // Looks the class up again, after its name or namespace changed.
    void lookUp(Broker& broker);

    CIMObjectPath withNameSpace() const;
    CIMObjectPath withoutNameSpace() const; // nor host
    // Returns: the local path for the wire: the class's keys in its order, those that are missing empty, then the
    // others.
    CIMObjectPath delivered() const;

    const ClassSchema* schema = nullptr; // null: unknown class. The broker's cache owns it
    CIMNamespaceName nameSpace;
    String host;
    CIMName className;
    std::vector<PathKey> keys; // in the order in which they were added

  private:
    Array<CIMKeyBinding> bindings() const;
    CIMName keyNameOf(const char* name, CMPIType type) const;
};

} // namespace Pegasus::cmpi
