// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMInstance.h>

#include <cstddef>
#include <cstring>
#include <memory>
#include <new>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

namespace Pegasus {

// The types of values that are packed.
template <typename T>
constexpr bool kIsPackable = std::is_arithmetic_v<T> || std::is_same_v<T, String> || std::is_same_v<T, CIMDateTime>;

// What instances of one shape have in common. Thread: any; it stays as it was made.
struct InstanceLayout
{
    struct Key
    {
        CIMName fName;
        CIMKeyBinding::Type fType;
    };

    CIMName fClassName; // of the path
    std::vector<Key> fKeys;
    // Of packable types and without qualifiers. A value that is short is one that many instances may have.
    std::vector<CIMProperty> fProperties;
};

// What an instance has of a property of its layout.
enum class PackedState : Uint8
{
    kAbsent, // it lacks the property
    kNull,
    kShared, // the value that the layout has
    kValue
};

// Writes the values of an instance one after the other: the texts of the keys, then a state for each property. A value
// of its own follows the state, an array's as its size and its elements.
class PackedWriter
{
  public:
    void clear()
    {
        fBytes.clear();
        if (fBytes.capacity() > kKeptBytes) {
            fBytes.shrink_to_fit();
        }
        fTexts = 0;
    }
    std::string_view bytes() const { return fBytes; }
    // Returns: the number of texts among the values.
    std::size_t texts() const { return fTexts; }

    void putState(PackedState state) { put(static_cast<Uint8>(state)); }
    template <typename T> void put(T value)
    {
        static_assert(std::is_arithmetic_v<T>);
        fBytes.append(reinterpret_cast<const char*>(&value), sizeof value);
    }
    void putText(std::string_view utf8)
    {
        put(static_cast<Uint32>(utf8.size()));
        fBytes.append(utf8);
        ++fTexts;
    }
    // An array's size, once its elements are known. Returns: where to put it.
    std::size_t reserveSize()
    {
        put(Uint32(0));
        return fBytes.size() - sizeof(Uint32);
    }
    void putSize(std::size_t at, Uint32 size) { std::memcpy(fBytes.data() + at, &size, sizeof size); }

  private:
    // More than usual instances have. The memory of a bigger one is given back, because writers live long.
    static constexpr std::size_t kKeptBytes = 64UL * 1024;

    std::string fBytes;
    std::size_t fTexts = 0;
};

// Reads what a PackedWriter wrote, in the same order.
class PackedReader
{
  public:
    explicit PackedReader(const char* bytes) : fAt(bytes) {}

    PackedState takeState() { return static_cast<PackedState>(take<Uint8>()); }
    template <typename T> T take()
    {
        T value;
        std::memcpy(&value, fAt, sizeof value);
        fAt += sizeof value;
        return value;
    }
    std::string_view takeText()
    {
        const auto size = take<Uint32>();
        fAt += size;
        return {fAt - size, size};
    }

  private:
    const char* fAt;
};

// The values of an instance in one piece of memory, with a layout that it shares with others. An answer's instances
// are kept so until something asks for what is in them: packed they take a fraction of the memory, and none of them
// makes an object for a property.
class PackedInstance
{
  public:
    // `values` come from a PackedWriter and fit the layout: each text is UTF-8, as base::decodeUtf8() has it, and a
    // datetime's is one.
    static std::unique_ptr<const PackedInstance> create(std::shared_ptr<const InstanceLayout> layout,
                                                        std::string_view values)
    {
        void* memory = ::operator new(sizeof(PackedInstance) + values.size());
        auto* packed = new (memory) PackedInstance(std::move(layout));
        std::memcpy(static_cast<void*>(packed + 1), values.data(), values.size());
        return std::unique_ptr<const PackedInstance>(packed);
    }
    static void operator delete(void* memory) { ::operator delete(memory); }

    void unpack(CIMObjectPath& path, Array<CIMProperty>& properties) const;

  private:
    explicit PackedInstance(std::shared_ptr<const InstanceLayout> layout) : fLayout(std::move(layout)) {}

    std::shared_ptr<const InstanceLayout> fLayout;
};

} // namespace Pegasus
