#pragma once

#include "pegasus/cmpi/ObjectPathObject.h"

#include <Pegasus/Common/CIMInstance.h>

#include <cstdint>
#include <vector>

namespace Pegasus::cmpi {

class PropertyFilter;

// A CMPIInstance. Of a known class it shows every declared property, null or default until set, and delivers those that
// were set or have a default; of an unknown class, what was set.
// Path and properties are apart: a key that only one side has is completed from it when the path is asked for.
class InstanceObject final : public Owned, public CMPIInstance
{
  public:
    // Starts with the path's keys as properties.
    InstanceObject(Broker& owner, const PathState& path);
    // `instance` came from the server; `nameSpace` is where its class is declared (null: an embedded instance's own
    // path).
    InstanceObject(Broker& owner, const CIMInstance& instance, const CIMNamespaceName& nameSpace = CIMNamespaceName());
    InstanceObject(const InstanceObject& other);

    CMPICount propertyCount() const;
    // Throws: CMPI_RC_ERR_NO_SUCH_PROPERTY.
    CMPIData property(const char* name) const;
    CMPIData propertyAt(CMPICount index, CMPIString** name) const;
    // A name that the class does not have is dropped without an error, with a warning in the log.
    // Throws: CMPI_RC_ERR_INVALID_DATA_TYPE when the type is not the declared one.
    void setProperty(const char* name, const CMPIValue* value, CMPIType type);

    PathState completePath() const;
    // Throws: CMPI_RC_ERR_FAILED when the class differs.
    void setPath(const PathState& path);

    // The instance for the wire: its path has no name space, its properties are in the class's order.
    CIMInstance filtered(const PropertyFilter& filter) const;
    // All of it, for embedding.
    CIMInstance value() const;

    Broker& broker;
    Lifetime lifetime = Lifetime::kFrame;

  private:
    const CIMValue& valueAt(std::size_t index) const;
    void store(std::size_t index, CIMValue value);
    void storeExtra(const CIMName& name, CIMValue value);
    void takeKeys();
    void takeProperties(const CIMInstance& instance);
    CMPIData encode(std::size_t index) const;

    PathState fPath;
    std::vector<std::uint16_t> fPlaces; // by declared property: 0 not set, else the place in fSet + 1
    std::vector<CIMValue> fSet;
    std::vector<NamedValue> fExtra; // the properties, when the class is unknown
};

extern const CMPIInstanceFT kInstanceTable;

} // namespace Pegasus::cmpi
