// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <list>
#include <string>

namespace fuzz {

// The namespace of the server's classes; an input can name it.
constexpr const char* kNamespace = "root/fuzz";

// The bytes of an input, read from the first to the last. Every byte beyond the end is 0.
class CallInput
{
  public:
    CallInput(const std::uint8_t* data, std::size_t size) : fAt(data), fEnd(data + size) {}

    bool isAtEnd() const { return fAt == fEnd; }
    std::uint8_t byte() { return isAtEnd() ? std::uint8_t{0} : *fAt++; }

    // Returns: a name or text that means something, one of the input's own, or null.
    // Ownership: the text lives as long as this input.
    const char* text();

  private:
    const std::uint8_t* fAt;
    const std::uint8_t* fEnd;
    std::list<std::string> fOwn;
};

// The places for objects of one kind.
template <typename Face> class Places
{
  public:
    static constexpr std::size_t kCount = 4;

    void put(CallInput& in, Face* object) { fObjects[in.byte() % kCount] = object; }

    // Returns: an object, null, or one without a handle.
    Face* get(CallInput& in)
    {
        const std::uint8_t choice = in.byte();
        if (choice == 0xFF && fObjects[0] != nullptr) {
            fBroken = *fObjects[0];
            fBroken.hdl = nullptr;
            return &fBroken;
        }
        return fObjects[choice % (kCount + 1)];
    }

    void forget(const Face* object)
    {
        for (Face*& at : fObjects) {
            at = at == object ? nullptr : at;
        }
    }

  private:
    Face* fObjects[kCount + 1] = {}; // the last one stays null
    Face fBroken{};
};

} // namespace fuzz
