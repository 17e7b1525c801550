// SPDX-License-Identifier: MIT
// The functions of the objects that a provider has.
#include "tests/providers/TestBrokerObjects.h"
#include "tests/providers/TestBrokerValues.h"

#include <memory>
#include <string>

namespace lnx {

namespace {

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

} // namespace

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

} // namespace lnx
