// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <variant>
#include <vector>

namespace lnx {

struct Char16
{
    std::uint16_t code;
};

// A point in time in microseconds since 1970, UTC, or the length of an interval.
struct DateTime
{
    std::uint64_t microseconds;
    bool isInterval;
};

struct Reference
{
    std::string className;
    std::vector<std::pair<std::string, std::string>> keys;
};

// A property's value. Every CIM type has one alternative.
using Value = std::variant<bool, std::uint8_t, std::int8_t, std::uint16_t, std::int16_t, std::uint32_t, std::int32_t,
                           std::uint64_t, std::int64_t, float, double, Char16, std::string, DateTime, Reference,
                           std::vector<std::uint8_t>, std::vector<std::uint16_t>, std::vector<std::uint32_t>,
                           std::vector<float>, std::vector<Char16>, std::vector<std::string>>;

struct Property
{
    std::string name;
    Value value;
    bool isKey;
};

// One instance, before it becomes a broker's. A property whose value the machine lacks is left out, and so null.
class Record
{
  public:
    explicit Record(std::string className) : fClassName(std::move(className)) {}

    const std::string& className() const { return fClassName; }
    const std::vector<Property>& properties() const { return fProperties; }

    void key(const char* name, Value value) { fProperties.push_back({name, std::move(value), true}); }
    void set(const char* name, Value value) { fProperties.push_back({name, std::move(value), false}); }
    template <typename T> void set(const char* name, const std::optional<T>& value)
    {
        if (value) {
            set(name, Value(*value));
        }
    }

    // Returns: the value of that property; null when it was left out.
    const Value* find(const std::string& name) const;

    // Returns: a reference to this instance.
    // Requires: all keys are strings.
    Reference reference() const;

  private:
    std::string fClassName;
    std::vector<Property> fProperties;
};

} // namespace lnx
