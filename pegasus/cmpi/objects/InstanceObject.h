// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/ProviderValue.h"
#include "pegasus/cmpi/objects/ValueCodec.h"

#include <Pegasus/Common/CIMInstance.h>

#include <cstdint>
#include <string>
#include <vector>

namespace Pegasus::cmpi {

class PropertyFilter;

// A CMPIInstance.
//
// An instance of a known class shows and delivers every declared property, with its default or null until it is set. An
// instance of an unknown class has the properties that were set.
// Path and key properties are separate, as in CMPI: a key that is missing in the path is taken from the property when
// the path is asked for.
class InstanceObject final : public Owned, public CMPIInstance
{
  public:
    // The path's keys become properties.
    InstanceObject(Broker& owner, const PathState& path);
    // An instance from the server. `nameSpace` is where its class is declared; null takes it from the instance's path.
    InstanceObject(Broker& owner, const CIMInstance& instance, const CIMNamespaceName& nameSpace = CIMNamespaceName());
    InstanceObject(const InstanceObject& other);
    ~InstanceObject() override;

    CMPICount propertyCount() const;
    // Throws: CMPI_RC_ERR_NO_SUCH_PROPERTY.
    CMPIData property(const char* name) const;
    CMPIData propertyAt(CMPICount index, CMPIString** name) const;
    // A property that the class lacks is dropped with a warning in the log: providers run against older schemas.
    // Throws: CMPI_RC_ERR_INVALID_DATA_TYPE when the type differs from the declared one.
    void setProperty(const char* name, const CMPIValue* value, CMPIType type);

    PathState completePath() const;
    // Throws: CMPI_RC_ERR_FAILED when the class differs.
    void setPath(const PathState& path);

    // Returns: the instance for the wire: its path is local, keys and properties are in the class's order. An instance
    //     of an unknown class has the properties that were set, the last one first, and none where the client gave a
    //     list: as on OpenPegasus. The log names the class then.
    CIMInstance delivered(const PropertyFilter& filter) const;
    // Throws: UninitializedObjectException for an instance without a class name.
    // Appends the same instance as VALUE.NAMEDINSTANCE, without making the objects in between. Throws: the same.
    void appendDelivered(std::string& out, const PropertyFilter& filter) const;
    // Returns: the instance with all properties, for embedding and upcalls.
    CIMInstance value() const;

    Broker& broker;
    Lifetime lifetime = Lifetime::kFrame;

  private:
    CIMValue valueAt(std::size_t index) const;
    void store(std::size_t index, const CMPIValue* value, CMPIType type);
    void storeExtra(const CIMName& name, CIMValue value);
    void takeKeys();
    void takeProperties(const CIMInstance& instance);
    CMPIData encode(std::size_t index) const;
    CIMObjectPath deliveredPath() const;
    bool appendPlainName(std::string& out) const;
    CIMInstance filtered(const PropertyFilter& filter) const;
    // Returns: what an instance of an unknown class delivers.
    std::vector<const NamedValue*> undeclared(const PropertyFilter& filter) const;

    PathState fPath;
    std::vector<ProviderValue> fValues; // by declared property
    std::size_t fLastSet;               // the declared property that the provider set last; kNotFound at first
    std::uint32_t fPathKeys = 0;        // by key of the class, up to 32: its property has the path's value alone
    std::vector<NamedValue> fExtra;     // the properties, when the class is unknown
};

extern const CMPIInstanceFT kInstanceTable;

} // namespace Pegasus::cmpi
