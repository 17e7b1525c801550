// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/services/SchemaCache.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <mutex>

namespace Pegasus::cmpi {
namespace {

std::string keyOf(std::string_view nameSpace, std::string_view className)
{
    return base::foldCase(std::string(nameSpace).append(1, ':').append(className));
}

} // namespace

const ClassSchema* SchemaCache::find(std::string_view nameSpace, std::string_view className)
{
    const std::string key = keyOf(nameSpace, className);
    std::uint64_t request = 0;
    {
        const std::shared_lock lock(fMutex);
        request = fRequest;
        const auto found = fEntries.find(key);
        if (found != fEntries.end() && (found->second.schema || found->second.asked == request)) {
            return found->second.schema.get();
        }
    }
    std::unique_ptr<ClassSchema> loaded = load(nameSpace, className);

    const std::unique_lock lock(fMutex);
    Entry& entry = fEntries[key];
    if (!entry.schema) { // else another thread was first, and its schema may be in use already
        entry.schema = std::move(loaded);
        entry.asked = request;
    }
    return entry.schema.get();
}

void SchemaCache::beginRequest()
{
    const std::unique_lock lock(fMutex);
    ++fRequest;
}

std::unique_ptr<ClassSchema> SchemaCache::load(std::string_view nameSpace, std::string_view className)
{
    try {
        const CIMClass found = fServices.getClass(CIMNamespaceName(base::fromUtf8Repaired(nameSpace)),
                                                  CIMName(base::fromUtf8Repaired(className)));
        return std::make_unique<ClassSchema>(found);
    } catch (const CIMException& error) {
        if (error.getCode() == CIM_ERR_NOT_FOUND || error.getCode() == CIM_ERR_INVALID_NAMESPACE) {
            return nullptr;
        }
        logFailure(nameSpace, className, error);
    } catch (const Exception& error) {
        logFailure(nameSpace, className, error);
    }
    return nullptr;
}

void SchemaCache::logFailure(std::string_view nameSpace, std::string_view className, const Exception& error)
{
    fServices.log(BrokerServices::Severity::kWarning, "GetClass " + std::string(className) + " in " +
                                                          std::string(nameSpace) + ": " +
                                                          base::utf8(error.getMessage()));
}

} // namespace Pegasus::cmpi
