// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/common/EmbeddedKind.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace Pegasus::cmpi {

// One declared property, with its name in both encodings and its tag: making them per instance would cost more than the
// value.
struct PropertySchema
{
    CIMName name;
    std::string text; // the name in UTF-8
    CIMType type = CIMTYPE_STRING;
    bool isArray = false;
    bool isKey = false;
    bool isInherited = false;
    EmbeddedKind embedded = EmbeddedKind::kNone;
    CIMName referenceClass;
    CIMValue initial;  // null of the declared type, or the class's default
    std::string start; // the start tag of PROPERTY; empty where it depends on the value
};

// A class as the broker needs it for every property of every instance: found by name fast, types at hand.
// Thread: immutable after construction.
class ClassSchema
{
  public:
    static constexpr std::size_t kNotFound = static_cast<std::size_t>(-1);

    explicit ClassSchema(const CIMClass& source);
    ClassSchema(const ClassSchema&) = delete;
    ClassSchema& operator=(const ClassSchema&) = delete;

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
    struct NoCaseHash
    {
        std::size_t operator()(std::string_view name) const noexcept;
    };
    struct NoCaseEqual
    {
        bool operator()(std::string_view x, std::string_view y) const noexcept { return base::equalNoCase(x, y); }
    };

    void addProperty(const CIMConstProperty& property);

    CIMName fName;
    std::string fText;
    CIMName fSuperClass;
    std::vector<PropertySchema> fProperties;
    std::vector<std::size_t> fKeys;
    std::unordered_map<std::string_view, std::size_t, NoCaseHash, NoCaseEqual> fIndices; // keys view fProperties
};

} // namespace Pegasus::cmpi
