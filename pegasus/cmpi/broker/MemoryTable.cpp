// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/ArrayObject.h"
#include "pegasus/cmpi/objects/DateTimeObject.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <algorithm>
#include <cstring>
#include <new>

// Memory that ends with the frame in which it was made, and frames that the provider opens itself.
namespace Pegasus::cmpi {
namespace {

// A block of plain memory that a frame owns. The provider holds the address of the bytes after this header, which is
// how free and realloc find it again.
class alignas(std::max_align_t) MemoryBlock final : public Owned
{
  public:
    static MemoryBlock* make(std::size_t size)
    {
        void* memory =
            size > SIZE_MAX - sizeof(MemoryBlock) ? nullptr : ::operator new(sizeof(MemoryBlock) + size, std::nothrow);
        if (memory == nullptr) {
            return nullptr;
        }
        auto* block = new (memory) MemoryBlock(size);
        Frame::current().adopt(*block);
        return block;
    }
    static MemoryBlock* of(void* bytes) { return static_cast<MemoryBlock*>(bytes) - 1; }

    void* bytes() { return this + 1; }
    std::size_t size() const { return fSize; }

    static void operator delete(void* memory) { ::operator delete(memory); }

  private:
    explicit MemoryBlock(std::size_t size) : fSize(size) {}
    static void* operator new(std::size_t, void* place) { return place; }

    std::size_t fSize;
};

// A frame that a provider opened. The frame around it owns it and frees it if the provider forgets.
class MarkedFrame final : public Owned, public Frame
{
};

CMPIGcStat* mark(const CMPIBroker*, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIGcStat*>(nullptr), []() -> CMPIGcStat* {
        Frame& around = Frame::current();
        auto* marked = new MarkedFrame;
        around.adopt(*marked);
        return static_cast<Frame*>(marked);
    });
}

CMPIStatus release(const CMPIBroker*, const CMPIGcStat* mark)
{
    return perform([&] {
        const auto* frame = static_cast<const Frame*>(mark);
        if (mark == nullptr || !Frame::isOpen(frame)) {
            throw CmpiError{CMPI_RC_ERR_INVALID_HANDLE, {}};
        }
        delete static_cast<const MarkedFrame*>(frame);
    });
}

void* cmpiMalloc(const CMPIBroker*, std::size_t size)
{
    MemoryBlock* block = MemoryBlock::make(size);
    return block == nullptr ? nullptr : block->bytes();
}

void* cmpiCalloc(const CMPIBroker* broker, std::size_t count, std::size_t size)
{
    if (size != 0 && count > SIZE_MAX / size) {
        return nullptr;
    }
    void* bytes = cmpiMalloc(broker, count * size);
    return bytes == nullptr ? nullptr : std::memset(bytes, 0, count * size);
}

void cmpiFree(const CMPIBroker*, void* bytes)
{
    if (bytes != nullptr) {
        delete MemoryBlock::of(bytes);
    }
}

void* cmpiRealloc(const CMPIBroker* broker, void* bytes, std::size_t size)
{
    void* larger = cmpiMalloc(broker, size);
    if (larger == nullptr || bytes == nullptr) {
        return larger;
    }
    std::memcpy(larger, bytes, std::min(size, MemoryBlock::of(bytes)->size()));
    cmpiFree(broker, bytes);
    return larger;
}

char* cmpiStrDup(const CMPIBroker* broker, const char* text)
{
    if (text == nullptr) {
        return nullptr;
    }
    const std::size_t size = std::strlen(text) + 1;
    void* bytes = cmpiMalloc(broker, size);
    return bytes == nullptr ? nullptr : static_cast<char*>(std::memcpy(bytes, text, size));
}

template <typename Object, typename Face> void freeObject(const CMPIBroker*, Face* face)
{
    releaseObject<Object, Face>(face);
}

// Empty: select expressions would have to come from this broker, which refuses them.
void freeSelectExp(const CMPIBroker*, CMPISelectExp*) {}

void freeChars(const CMPIBroker* broker, char* chars)
{
    cmpiFree(broker, chars);
}

} // namespace

const CMPIBrokerMemFT kMemoryTable{CMPIVersion200,
                                   mark,
                                   release,
                                   cmpiMalloc,
                                   cmpiCalloc,
                                   cmpiRealloc,
                                   cmpiStrDup,
                                   cmpiFree,
                                   freeObject<InstanceObject, CMPIInstance>,
                                   freeObject<ObjectPathObject, CMPIObjectPath>,
                                   freeObject<ArgsObject, CMPIArgs>,
                                   freeObject<StringObject, CMPIString>,
                                   freeObject<ArrayObject, CMPIArray>,
                                   freeObject<DateTimeObject, CMPIDateTime>,
                                   freeSelectExp,
                                   freeChars};

} // namespace Pegasus::cmpi
