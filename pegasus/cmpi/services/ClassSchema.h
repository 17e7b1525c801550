// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/AsciiCase.h"
#include "pegasus/common/EmbeddedKind.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMValue.h>

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace Pegasus::cmpi {

// One declared property, with its name in both encodings and the text around its value: making them per instance would
// cost more than the value.
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
    CIMValue initial; // null of the declared type, or the class's default

    std::string start;    // the start tag of PROPERTY; empty where it depends on the value
    std::string unset;    // the whole element with the initial value; empty when `start` is
    std::string keyStart; // of a plain key: KEYBINDING up to the value's text
};

// A class as the broker needs it for every property of every instance: found by name fast, types at hand.
// Thread: any.
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
    // Returns: the start tags of INSTANCENAME and INSTANCE.
    const std::string& nameStart() const { return fNameStart; }
    const std::string& instanceStart() const { return fInstanceStart; }
    const std::vector<PropertySchema>& properties() const { return fProperties; }
    // Returns: the indices of the key properties, in declaration order.
    const std::vector<std::size_t>& keys() const { return fKeys; }

    // Returns: the index of the property of that name (case-insensitive), or kNotFound.
    std::size_t find(std::string_view name) const;
    // The same for one that sets property after property: fast when they come in the order of another instance.
    // `last` is what the call before returned for this instance, kNotFound at first.
    std::size_t findAfter(std::size_t last, const char* name) const;
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

    // What follows is immutable after construction, but for fFollowers.
    CIMName fName;
    std::string fText;
    std::string fNameStart;
    std::string fInstanceStart;
    CIMName fSuperClass;
    std::vector<PropertySchema> fProperties;
    std::vector<std::size_t> fKeys;
    std::unordered_map<std::string_view, std::size_t, NoCaseHash, NoCaseEqual> fIndices; // keys view fProperties
    // By property, plus 1: the one that was found after it the last time. A guess, which is compared before it is used.
    mutable std::vector<std::atomic<std::uint32_t>> fFollowers;
};

} // namespace Pegasus::cmpi
