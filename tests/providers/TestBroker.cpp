// SPDX-License-Identifier: MIT
#include "tests/providers/TestBroker.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

#if defined(__SANITIZE_ADDRESS__)
#define IS_ADDRESS_SANITIZED true
#else
#define IS_ADDRESS_SANITIZED false
#endif

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

namespace {

constexpr CMPIStatus kOk{CMPI_RC_OK, nullptr};

CMPIStatus refusal(CMPIrc code)
{
    return {code, nullptr};
}

[[noreturn]] void unexpected()
{
    std::fputs("the test broker lacks the function that the provider calls\n", stderr);
    std::abort();
}

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

void leave(CMPIStatus* rc, CMPIrc code)
{
    if (rc != nullptr) {
        *rc = refusal(code);
    }
}

extern const CMPIStringFT kStrings;
extern const CMPIDateTimeFT kDateTimes;
extern const CMPIArrayFT kArrays;
extern const CMPIObjectPathFT kPaths;
extern const CMPIInstanceFT kInstances;
extern const CMPIArgsFT kArgs;
extern const CMPIResultFT kResults;
extern const CMPIContextFT kContexts;

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

std::size_t sizeOf(CMPIType type)
{
    switch (type) {
    case CMPI_boolean:
    case CMPI_uint8:
    case CMPI_sint8:
        return 1;
    case CMPI_char16:
    case CMPI_uint16:
    case CMPI_sint16:
        return 2;
    case CMPI_uint32:
    case CMPI_sint32:
    case CMPI_real32:
        return 4;
    case CMPI_uint64:
    case CMPI_sint64:
    case CMPI_real64:
        return 8;
    default:
        return 0;
    }
}

std::string hexOf(const void* bytes, std::size_t size)
{
    std::string text;
    for (std::size_t i = 0; i < size; ++i) {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02x", static_cast<const unsigned char*>(bytes)[i]);
        text += digits;
    }
    return text;
}

std::string textOfArray(const ArrayObject& array)
{
    std::string text;
    for (const ArrayObject::Element& element : array.content) {
        text += element.kept != nullptr ? of<StringObject>(element.kept).text() : element.value.text;
        text += ',';
    }
    return text;
}

// Returns: a value as the provider passes it. An unknown type leaves it null, with that type.
BrokerValue read(const CMPIValue* value, CMPIType type)
{
    BrokerValue result{type, false, {}, nullptr};
    if (value == nullptr) {
        result.isNull = true;
    } else if (type == CMPI_chars) {
        result.type = CMPI_string;
        result.text = reinterpret_cast<const char*>(value);
    } else if (type == CMPI_string) {
        result.text = of<StringObject>(value->string).text();
    } else if (type == CMPI_dateTime) {
        result.text = of<DateTimeObject>(value->dateTime).content;
    } else if (type == CMPI_ref) {
        result.path = std::make_shared<PathContent>(of<PathObject>(value->ref).content);
    } else if ((type & CMPI_ARRAY) != 0) {
        result.text = textOfArray(of<ArrayObject>(value->array));
    } else if (const std::size_t size = sizeOf(type); size != 0) {
        result.text = hexOf(value, size);
    } else {
        result.isNull = true;
    }
    return result;
}

bool isKnown(CMPIType type)
{
    const CMPIType element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    return sizeOf(element) != 0 || element == CMPI_chars || element == CMPI_string || element == CMPI_dateTime ||
           element == CMPI_ref;
}

CMPIStatus setValue(BrokerValues& values, const char* name, const CMPIValue* value, CMPIType type)
{
    if (name == nullptr || !isKnown(type)) {
        return refusal(name == nullptr ? CMPI_RC_ERR_INVALID_PARAMETER : CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    values[name] = read(value, type);
    return kOk;
}

// Returns: the value as data; its text or path is an object of the frame.
CMPIData dataOf(TestBroker& owner, const BrokerValues& values, const char* name, CMPIStatus* rc, CMPIrc missing)
{
    const auto found = values.find(name);
    CMPIData data{CMPI_null, CMPI_nullValue | CMPI_notFound, {}};
    leave(rc, found == values.end() || owner.fails("a getter") ? missing : CMPI_RC_OK);
    if (found == values.end() || !owner.report().failed.empty()) {
        return data;
    }
    data.type = found->second.type;
    data.state = found->second.isNull ? CMPI_nullValue : CMPI_goodValue;
    if (found->second.path != nullptr) {
        data.value.ref = owner.make(std::make_unique<PathObject>(*found->second.path), false);
    } else if (data.type == CMPI_string && !found->second.isNull) {
        data.value.string = owner.make(std::make_unique<StringObject>(found->second.text), false);
    }
    return data;
}

// ---- Tables of objects ----

template <typename Object, typename Table, typename Fill> Table tableOf(Fill&& fill)
{
    auto table = emptyTable<Table>();
    table.release = releaseFace<Object>;
    fill(table);
    return table;
}

CMPIString* frameText(BrokerObject& object, const std::string& text, CMPIStatus* rc)
{
    const bool fails = object.owner->fails("a getter");
    leave(rc, fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
    return fails ? nullptr : object.owner->make(std::make_unique<StringObject>(text), false);
}

const CMPIStringFT kStrings = tableOf<StringObject, CMPIStringFT>([](CMPIStringFT& table) {
    table.getCharPtr = [](const CMPIString* string, CMPIStatus* rc) {
        leave(rc, CMPI_RC_OK);
        return of<StringObject>(string).text();
    };
});
const CMPIDateTimeFT kDateTimes = tableOf<DateTimeObject, CMPIDateTimeFT>([](CMPIDateTimeFT&) {});
const CMPIContextFT kContexts = tableOf<ContextObject, CMPIContextFT>([](CMPIContextFT&) {});

const CMPIArrayFT kArrays = tableOf<ArrayObject, CMPIArrayFT>([](CMPIArrayFT& table) {
    table.setElementAt = [](const CMPIArray* face, CMPICount index, const CMPIValue* value, CMPIType type) {
        auto& array = of<ArrayObject>(face);
        if (array.owner->fails("setElementAt")) {
            return refusal(CMPI_RC_ERR_FAILED);
        }
        if (index >= array.content.size() || value == nullptr || type != array.type) {
            return refusal(index >= array.content.size() ? CMPI_RC_ERR_NO_SUCH_PROPERTY
                           : value == nullptr            ? CMPI_RC_ERR_INVALID_PARAMETER
                                                         : CMPI_RC_ERR_TYPE_MISMATCH);
        }
        array.content[index] = {read(value, type), type == CMPI_string ? value->string : nullptr};
        return kOk;
    };
});

const CMPIObjectPathFT kPaths = tableOf<PathObject, CMPIObjectPathFT>([](CMPIObjectPathFT& table) {
    table.getNameSpace = [](const CMPIObjectPath* face, CMPIStatus* rc) {
        return frameText(of<PathObject>(face), of<PathObject>(face).content.nameSpace, rc);
    };
    table.getClassName = [](const CMPIObjectPath* face, CMPIStatus* rc) {
        return frameText(of<PathObject>(face), of<PathObject>(face).content.className, rc);
    };
    table.toString = [](const CMPIObjectPath* face, CMPIStatus* rc) {
        return frameText(of<PathObject>(face), of<PathObject>(face).content.className, rc);
    };
    table.addKey = [](const CMPIObjectPath* face, const char* name, const CMPIValue* value, CMPIType type) {
        auto& path = of<PathObject>(face);
        if (path.owner->fails("addKey")) {
            return refusal(CMPI_RC_ERR_FAILED);
        }
        const bool isRefused = value == nullptr || (type & CMPI_ARRAY) != 0;
        return isRefused ? refusal(CMPI_RC_ERR_INVALID_DATA_TYPE) : setValue(path.content.keys, name, value, type);
    };
    table.getKey = [](const CMPIObjectPath* face, const char* name, CMPIStatus* rc) {
        auto& path = of<PathObject>(face);
        return dataOf(*path.owner, path.content.keys, name, rc, CMPI_RC_ERR_NOT_FOUND);
    };
});

const CMPIInstanceFT kInstances = tableOf<InstanceObject, CMPIInstanceFT>([](CMPIInstanceFT& table) {
    table.setProperty = [](const CMPIInstance* face, const char* name, const CMPIValue* value, CMPIType type) {
        auto& instance = of<InstanceObject>(face);
        return instance.owner->fails("setProperty") ? refusal(CMPI_RC_ERR_FAILED)
                                                    : setValue(instance.content.properties, name, value, type);
    };
});

const CMPIArgsFT kArgs = tableOf<ArgsObject, CMPIArgsFT>([](CMPIArgsFT& table) {
    table.getArg = [](const CMPIArgs* face, const char* name, CMPIStatus* rc) {
        auto& args = of<ArgsObject>(face);
        return dataOf(*args.owner, args.content, name, rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    };
    table.addArg = [](const CMPIArgs* face, const char* name, const CMPIValue* value, CMPIType type) {
        auto& args = of<ArgsObject>(face);
        return args.owner->fails("addArg") ? refusal(CMPI_RC_ERR_FAILED) : setValue(args.content, name, value, type);
    };
});

const CMPIResultFT kResults = tableOf<ResultObject, CMPIResultFT>([](CMPIResultFT& table) {
    table.returnInstance = [](const CMPIResult* face, const CMPIInstance* instance) {
        TestBroker& owner = *of<ResultObject>(face).owner;
        const InstanceContent& content = of<InstanceObject>(instance).content;
        if (owner.fails("returnInstance")) {
            return refusal(CMPI_RC_ERR_FAILED);
        }
        owner.report().results.push_back(content);
        return kOk;
    };
    table.returnObjectPath = [](const CMPIResult* face, const CMPIObjectPath* path) {
        TestBroker& owner = *of<ResultObject>(face).owner;
        const PathContent& content = of<PathObject>(path).content;
        if (owner.fails("returnObjectPath")) {
            return refusal(CMPI_RC_ERR_FAILED);
        }
        owner.report().results.push_back({content, {}});
        return kOk;
    };
    table.returnData = [](const CMPIResult* face, const CMPIValue* value, CMPIType type) {
        TestBroker& owner = *of<ResultObject>(face).owner;
        if (owner.fails("returnData")) {
            return refusal(CMPI_RC_ERR_FAILED);
        }
        owner.report().returned = read(value, type);
        return kOk;
    };
    table.returnDone = [](const CMPIResult* face) {
        TestBroker& owner = *of<ResultObject>(face).owner;
        if (owner.fails("returnDone")) {
            return refusal(CMPI_RC_ERR_FAILED);
        }
        owner.report().isDone = true;
        return kOk;
    };
});

// ---- Factories ----

TestBroker& brokerOf(const CMPIBroker* face)
{
    return *static_cast<TestBroker*>(const_cast<void*>(face->hdl));
}

// Makes an object; null when the function is to fail.
template <typename Object, typename... Args>
Object* made(const CMPIBroker* face, const char* name, CMPIStatus* rc, Args&&... args)
{
    TestBroker& owner = brokerOf(face);
    const bool fails = owner.fails(name);
    leave(rc, fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
    return fails ? nullptr : owner.make(std::make_unique<Object>(std::forward<Args>(args)...), true);
}

const CMPIBrokerFT kUpcalls = [] {
    auto table = emptyTable<CMPIBrokerFT>();
    table.brokerVersion = CMPIVersion200;
    table.brokerName = "test";
    return table;
}();

const CMPIBrokerEncFT kFactories = [] {
    auto table = emptyTable<CMPIBrokerEncFT>();
    table.newString = [](const CMPIBroker* face, const char* text, CMPIStatus* rc) -> CMPIString* {
        return made<StringObject>(face, "newString", rc, text);
    };
    table.newObjectPath = [](const CMPIBroker* face, const char* nameSpace, const char* className,
                             CMPIStatus* rc) -> CMPIObjectPath* {
        return made<PathObject>(face, "newObjectPath", rc, PathContent{nameSpace, className, {}});
    };
    table.newInstance = [](const CMPIBroker* face, const CMPIObjectPath* path, CMPIStatus* rc) -> CMPIInstance* {
        return made<InstanceObject>(face, "newInstance", rc, of<PathObject>(path).content);
    };
    table.newArray = [](const CMPIBroker* face, CMPICount size, CMPIType type, CMPIStatus* rc) -> CMPIArray* {
        return made<ArrayObject>(face, "newArray", rc, size, type);
    };
    table.newDateTimeFromBinary = [](const CMPIBroker* face, CMPIUint64 time, CMPIBoolean,
                                     CMPIStatus* rc) -> CMPIDateTime* {
        return made<DateTimeObject>(face, "newDateTimeFromBinary", rc, std::to_string(time));
    };
    return table;
}();

const CMPIBrokerExtFT kThreads = emptyTable<CMPIBrokerExtFT>();

} // namespace

TestBroker::TestBroker() : fFace{this, &kUpcalls, &kFactories, &kThreads, nullptr} {}

TestBroker::~TestBroker() = default;

template <typename Object> Object* TestBroker::make(std::unique_ptr<Object> object, bool isFromFactory)
{
    Object* made = object.get();
    made->owner = this;
    made->isFromFactory = isFromFactory;
    fLive[made] = std::move(object);
    return made;
}

CMPIStatus TestBroker::release(BrokerObject& object)
{
    if (object.isArgument) {
        return kOk;
    }
    auto held = std::move(fLive.extract(&object).mapped());
    if (!IS_ADDRESS_SANITIZED) {
        held->wipe();
        held->isReleased = true;
        fReleased.push_back(std::move(held));
    }
    return kOk;
}

void TestBroker::use(const BrokerObject& object)
{
    if (object.isReleased) {
        fReport.faults.push_back(std::string("a ") + object.kind + " was used after its release");
    }
}

bool TestBroker::fails(const char* name)
{
    if (++fReport.calls != fFailAt) {
        return false;
    }
    fReport.failed = name;
    return true;
}

CMPIObjectPath* TestBroker::pathArgument(PathContent content)
{
    auto* path = make(std::make_unique<PathObject>(std::move(content)), false);
    path->isArgument = true;
    return path;
}

CMPIArgs* TestBroker::argsArgument(BrokerValues content)
{
    auto* args = make(std::make_unique<ArgsObject>(std::move(content)), false);
    args->isArgument = true;
    return args;
}

void TestBroker::endFrame(const CMPIString* message)
{
    for (const auto& [object, holder] : fLive) {
        const bool isMessage = message != nullptr && object == &static_cast<const StringObject&>(*message);
        if (object->isFromFactory && !isMessage) {
            fReport.faults.push_back(std::string("a ") + object->kind + " was left");
        }
    }
    fLive.clear();
    fReleased.clear();
}

CallReport TestBroker::run(const Call& call, unsigned failAt)
{
    fReport = {};
    fFailAt = failAt;
    auto* out = make(std::make_unique<ArgsObject>(BrokerValues()), false);
    auto* context = make(std::make_unique<ContextObject>(), false);
    auto* result = make(std::make_unique<ResultObject>(), false);
    out->isArgument = context->isArgument = result->isArgument = true;
    const CMPIStatus status = call(context, result, out);
    fReport.code = status.rc;
    if (status.msg != nullptr) {
        fReport.text = of<StringObject>(status.msg).text();
    }
    fReport.outputs = out->content;
    endFrame(status.msg);
    return fReport;
}

} // namespace lnx
