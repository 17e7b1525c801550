#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::cmpi {

// One declared property, with its name in both encodings: converting it per instance would cost more than the value.
struct PropertySchema
{
    CIMName name;
    std::string text; // the name in UTF-8
    CIMType type = CIMTYPE_STRING;
    bool isArray = false;
    bool isKey = false;
    bool isEmbedded = false;       // an embedded object or instance, or a string that stands for one
    bool isEmbeddedObject = false; // an embedded object
    CIMName referenceClass;
    CIMValue initial; // null of the declared type, or the class's default
};

// A class as the broker needs it for every property of every instance: found by name fast, types at hand.
// Thread: immutable after construction.
class ClassSchema
{
  public:
    static constexpr std::size_t kNotFound = static_cast<std::size_t>(-1);

    explicit ClassSchema(const CIMClass& source);

    const CIMName& name() const { return fName; }
    const std::string& text() const { return fText; }
    const CIMName& superClass() const { return fSuperClass; }
    const std::vector<PropertySchema>& properties() const { return fProperties; }
    // Returns: the indices of the key properties, in declaration order.
    const std::vector<std::size_t>& keys() const { return fKeys; }

    // Returns: the index of the property of that name (case-insensitive), or kNotFound.
    std::size_t find(std::string_view name) const;
    // The same among the keys.
    std::size_t findKey(const CIMName& name) const;

  private:
    void addProperty(const CIMConstProperty& property);
    void index();

    CIMName fName;
    std::string fText;
    CIMName fSuperClass;
    std::vector<PropertySchema> fProperties;
    std::vector<std::size_t> fKeys;
    std::vector<std::uint32_t> fBuckets; // open addressing, a power of two; 0 is free, else index + 1
};

} // namespace Pegasus::cmpi
