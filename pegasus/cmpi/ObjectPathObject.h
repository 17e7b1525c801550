#pragma once

#include "pegasus/cmpi/ClassSchema.h"
#include "pegasus/cmpi/ValueCodec.h"

#include <Pegasus/Common/CIMObjectPath.h>

#include <vector>

namespace Pegasus::cmpi {

// A path with typed keys, as paths and instances hold it. The class need not exist.
struct PathState
{
    // Throws: CMPI_RC_ERR_INVALID_PARAMETER when the name space or class has no legal name; an empty one is no name.
    PathState(Broker& broker, const char* nameSpace, const char* className);
    PathState(Broker& broker, const CIMObjectPath& path);

    // Replaces the key of that name; a null value takes it out.
    // Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for arrays, instances and untyped nulls; CMPI_RC_ERR_INVALID_PARAMETER when
    //     the class is known and has no such key.
    void addKey(const char* name, const CMPIValue* value, CMPIType type);
    // Returns: the key of that name (case-insensitive), or null.
    const NamedValue* findKey(std::string_view name) const;
    const NamedValue* findKey(const CIMName& name) const;
    // Looks the class up again, after its name or name space changed.
    void lookUp(Broker& broker);

    CIMObjectPath withNameSpace() const;
    CIMObjectPath withoutNameSpace() const;

    const ClassSchema* schema = nullptr; // null: unknown class
    CIMNamespaceName nameSpace;
    String host;
    CIMName className;
    std::vector<NamedValue> keys;

  private:
    Array<CIMKeyBinding> bindings() const;
};

// A CMPIObjectPath.
class ObjectPathObject final : public Owned, public CMPIObjectPath
{
  public:
    ObjectPathObject(Broker& owner, PathState path);
    ObjectPathObject(Broker& owner, const CIMObjectPath& path) : ObjectPathObject(owner, PathState(owner, path)) {}
    ObjectPathObject(const ObjectPathObject& other) : ObjectPathObject(other.broker, other.state) {}

    CIMObjectPath value() const { return state.withNameSpace(); }

    Broker& broker;
    PathState state;
    Lifetime lifetime = Lifetime::kFrame;
};

extern const CMPIObjectPathFT kObjectPathTable;

} // namespace Pegasus::cmpi
