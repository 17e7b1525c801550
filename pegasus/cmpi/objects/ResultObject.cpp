// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ResultObject.h"

#include "pegasus/cmpi/objects/ErrorObject.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/ObjectPathObject.h"
#include "pegasus/cmpi/objects/ValueCodec.h"

#include <utility>

namespace Pegasus::cmpi {
namespace {

CMPIResult* noClone(const CMPIResult*, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIResult*>(nullptr), []() -> CMPIResult* {
        throw CmpiError{CMPI_RC_ERR_NOT_SUPPORTED, {}};
    });
}

CMPIStatus returnData(const CMPIResult* self, const CMPIValue* value, CMPIType type)
{
    return perform([&] { objectOf<ResultObject>(self).returnData(value, type); });
}

CMPIStatus returnInstance(const CMPIResult* self, const CMPIInstance* instance)
{
    return perform([&] { objectOf<ResultObject>(self).returnInstance(instance); });
}

CMPIStatus returnObjectPath(const CMPIResult* self, const CMPIObjectPath* path)
{
    return perform([&] { objectOf<ResultObject>(self).returnPath(path); });
}

CMPIStatus returnDone(const CMPIResult* self)
{
    return perform([&] { objectOf<ResultObject>(self).done(); });
}

// The error object adds to the status that the provider's function returns; the wire has room for that status alone.
CMPIStatus returnError(const CMPIResult* self, const CMPIError* error)
{
    return perform([&] {
        objectOf<ResultObject>(self);
        objectOf<ErrorObject>(error);
    });
}

} // namespace

const CMPIResultFT kResultTable{kTableVersion,  releaseObject<ResultObject, CMPIResult>,
                                noClone,        returnData,
                                returnInstance, returnObjectPath,
                                returnDone,     returnError};

ResultObject::ResultObject(const PropertyFilter& filter, InstanceSink instances, PathSink paths, ReturnValueSink data)
    : CMPIResult{nullptr, &kResultTable}, fFilter(filter), fInstances(std::move(instances)), fPaths(std::move(paths)),
      fData(std::move(data))
{
    hdl = this;
}

ResultObject::ResultObject(const PropertyFilter& filter, InstanceTextSink instances)
    : ResultObject(filter, nullptr, nullptr, nullptr)
{
    fTexts = std::move(instances);
}

template <typename Sink, typename Make> void ResultObject::deliver(const Sink& sink, Make&& make)
{
    if (!sink) {
        throw CmpiError{CMPI_RC_ERR_NOT_SUPPORTED, "the operation does not return this kind of result"};
    }
    if (fDone || fFailure) {
        throw CmpiError{CMPI_RC_ERR_FAILED, "the result is complete"};
    }
    const auto element = make();
    try {
        sink(element);
    } catch (const CmpiError&) {
        throw; // meant for the provider
    } catch (...) {
        fFailure = std::current_exception();
        throw CmpiError{CMPI_RC_ERR_FAILED, "the result is no longer wanted"};
    }
}

void ResultObject::returnInstance(const CMPIInstance* instance)
{
    if (!fTexts) {
        return deliver(fInstances, [&] { return objectOf<InstanceObject>(instance).delivered(fFilter); });
    }
    deliver(fTexts, [&] {
        fText.clear();
        objectOf<InstanceObject>(instance).appendDelivered(fText, fFilter);
        return std::string_view(fText);
    });
}

void ResultObject::returnPath(const CMPIObjectPath* path)
{
    deliver(fPaths, [&] { return objectOf<ObjectPathObject>(path).state.delivered(); });
}

void ResultObject::returnData(const CMPIValue* value, CMPIType type)
{
    deliver(fData, [&] {
        if (value == nullptr) {
            throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
        }
        return decodeValue(value, type);
    });
}

void ResultObject::rethrow() const
{
    if (fFailure) {
        std::rethrow_exception(fFailure);
    }
}

} // namespace Pegasus::cmpi
