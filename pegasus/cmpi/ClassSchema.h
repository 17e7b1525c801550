#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::cmpi {

// One declared property, with its name in both encodings so that no instance has to convert it again.
struct PropertySchema
{
    CIMName name;
    std::string text; // the name in UTF-8
    CIMType type = CIMTYPE_STRING;
    bool isArray = false;
    bool isKey = false;
    bool isEmbedded = false;       // an embedded object or instance, or a string that stands for one
    bool isEmbeddedObject = false; // the former
    CIMName referenceClass;
    CIMValue initial; // null of the declared type, or the class's default
};

// What the broker asks a class again and again, laid out for that.
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
    // The same among the keys; quick for names that come from this schema.
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
