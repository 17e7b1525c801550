// SPDX-License-Identifier: MIT
#pragma once

#include "tests/providers/TestBroker.h"

#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <utility>
#include <vector>

// The objects of the test broker, and what the functions of their tables share.
namespace lnx {

class BrokerObject
{
  public:
    explicit BrokerObject(const char* name) : kind(name) {}
    BrokerObject(const BrokerObject&) = delete;
    BrokerObject& operator=(const BrokerObject&) = delete;
    virtual ~BrokerObject() = default;
    virtual void wipe() {}

    const char* const kind;
    TestBroker* owner = nullptr;
    bool isFromFactory = false;
    bool isArgument = false;
    bool isReleased = false;
};

inline constexpr CMPIStatus kOk{CMPI_RC_OK, nullptr};

inline CMPIStatus refusal(CMPIrc code)
{
    return {code, nullptr};
}

// Ends the test.
[[noreturn]] void unexpected();

// Returns: a table whose functions end the test.
template <typename Table> Table emptyTable()
{
    Table table{};
    void (*const function)() = unexpected;
    for (std::size_t at = sizeof(void*); at + sizeof function <= sizeof table; at += sizeof function) {
        std::memcpy(reinterpret_cast<char*>(&table) + at, &function, sizeof function);
    }
    const CMPIVersion version = CMPIVersion200;
    std::memcpy(&table, &version, sizeof version);
    return table;
}

template <typename Face> struct Faced : BrokerObject, Face
{
    Faced(const char* name, const decltype(Face::ft) table) : BrokerObject(name), Face{this, table} {}
};

// Returns: the object of a handle; its use after its release is reported.
template <typename Object, typename Face> Object& of(const Face* face)
{
    auto& object = const_cast<Object&>(static_cast<const Object&>(*face));
    object.owner->use(object);
    return object;
}

template <typename Object, typename Face> CMPIStatus releaseFace(Face* face)
{
    auto& object = of<Object>(face);
    return object.owner->release(object);
}

// Sets the status that the provider passed, if any.
inline void leave(CMPIStatus* rc, CMPIrc code)
{
    if (rc != nullptr) {
        *rc = refusal(code);
    }
}

// TestBrokerTables.cpp
extern const CMPIStringFT kStrings;
extern const CMPIDateTimeFT kDateTimes;
extern const CMPIArrayFT kArrays;
extern const CMPIObjectPathFT kPaths;
extern const CMPIInstanceFT kInstances;
extern const CMPIArgsFT kArgs;
extern const CMPIResultFT kResults;
extern const CMPIContextFT kContexts;

// TestBrokerFactories.cpp
extern const CMPIBrokerFT kUpcalls;
extern const CMPIBrokerEncFT kFactories;
extern const CMPIBrokerExtFT kThreads;

struct StringObject : Faced<CMPIString>
{
    explicit StringObject(const std::string& text) : Faced("CMPIString", &kStrings)
    {
        hdl = ::strdup(text.c_str()); // the handle is the text
    }
    ~StringObject() override { std::free(hdl); }
    void wipe() override { std::memset(hdl, '#', std::strlen(text())); }
    const char* text() const { return static_cast<const char*>(hdl); }
};

struct DateTimeObject : Faced<CMPIDateTime>
{
    explicit DateTimeObject(std::string text) : Faced("CMPIDateTime", &kDateTimes), content(std::move(text)) {}
    std::string content;
};

struct PathObject : Faced<CMPIObjectPath>
{
    explicit PathObject(PathContent path) : Faced("CMPIObjectPath", &kPaths), content(std::move(path)) {}
    PathContent content;
};

struct InstanceObject : Faced<CMPIInstance>
{
    explicit InstanceObject(PathContent path) : Faced("CMPIInstance", &kInstances), content{std::move(path), {}} {}
    InstanceContent content;
};

struct ArgsObject : Faced<CMPIArgs>
{
    explicit ArgsObject(BrokerValues values) : Faced("CMPIArgs", &kArgs), content(std::move(values)) {}
    BrokerValues content;
};

struct ResultObject : Faced<CMPIResult>
{
    ResultObject() : Faced("CMPIResult", &kResults) {}
};

struct ContextObject : Faced<CMPIContext>
{
    ContextObject() : Faced("CMPIContext", &kContexts) {}
};

struct ArrayObject : Faced<CMPIArray>
{
    ArrayObject(CMPICount size, CMPIType element) : Faced("CMPIArray", &kArrays), type(element), content(size) {}
    CMPIType type;
    struct Element
    {
        BrokerValue value;
        const CMPIString* kept = nullptr; // of an array of CMPI_string: read when the array is used
    };
    std::vector<Element> content;
};

template <typename Object> Object* TestBroker::make(std::unique_ptr<Object> object, bool isFromFactory)
{
    Object* made = object.get();
    made->owner = this;
    made->isFromFactory = isFromFactory;
    fLive[made] = std::move(object);
    return made;
}

} // namespace lnx
