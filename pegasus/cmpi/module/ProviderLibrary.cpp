// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/module/ProviderLibrary.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/module/VendorCall.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <array>

#include <dlfcn.h>
#include <unistd.h>

namespace Pegasus::cmpi {
namespace {

constexpr std::array kKinds{"Instance", "Association", "Method", "Property", "Indication"};

CIMException failure(const std::string& text)
{
    return {CIM_ERR_FAILED, base::fromUtf8Repaired(text)};
}

std::string factoryOf(const std::string& provider, const std::string& kind)
{
    return provider + "_Create_" + kind + "MI";
}

const std::string kGeneric = "_Generic";

std::string initFailure(const std::string& path, const std::string& provider, const std::string& factory,
                        const std::string& reason)
{
    return "ProviderInitFailure: Error initializing " + path + ", provider " + provider + ", " + factory + ": " +
           reason;
}

} // namespace

ProviderLibrary::ProviderLibrary(const std::string& path)
    : fPath(path), fHandle(::dlopen(path.c_str(), RTLD_LAZY | RTLD_GLOBAL))
{
    if (fHandle != nullptr) {
        return;
    }
    const char* reason = ::dlerror();
    throw failure("ProviderLoadFailure: (" + path +
                  ") Cannot load library, error: " + (reason == nullptr ? "unknown" : reason));
}

ProviderLibrary::~ProviderLibrary()
{
    ::dlclose(fHandle);
}

void* ProviderLibrary::symbol(const std::string& name) const
{
    return ::dlsym(fHandle, name.c_str());
}

void ProviderLibrary::requireProvider(const std::string& provider) const
{
    const auto hasAny = [this](const std::string& prefix) {
        return std::any_of(kKinds.begin(), kKinds.end(),
                           [&](const char* kind) { return symbol(factoryOf(prefix, kind)) != nullptr; });
    };
    const bool isSpecific = hasAny(provider);
    const bool isGeneric = hasAny(kGeneric);
    if (isSpecific && isGeneric) {
        throw failure("ProviderLoadFailure: (" + fPath + ") has both generic and " + provider +
                      " entry points: which ones are meant is not clear.");
    }
    if (!isSpecific && !isGeneric) {
        throw failure("ProviderLoadFailure: (" + fPath + ") Provider is not a CMPI style provider. Cannot find " +
                      provider + "_Create<mi-type>MI symbol.");
    }
}

void* ProviderLibrary::createAny(const std::string& kind, const std::string& provider, const CMPIBroker& broker,
                                 const CMPIContext& context) const
{
    using Specific = void* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    using Generic = void* (*)(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);

    std::string name = factoryOf(provider, kind);
    void* const specific = symbol(name);
    if (specific == nullptr) {
        name = factoryOf(kGeneric, kind);
    }
    void* const generic = specific == nullptr ? symbol(name) : nullptr;
    if (specific == nullptr && generic == nullptr) {
        return nullptr;
    }
    const auto fail = [&](const char* reason) { throw failure(initFailure(fPath, provider, name, reason)); };
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const auto create = [&] {
        return specific != nullptr ? reinterpret_cast<Specific>(specific)(&broker, &context, &status)
                                   : reinterpret_cast<Generic>(generic)(&broker, &context, provider.c_str(), &status);
    };
    void* const made = callVendor(create, fail);
    const bool hasText = status.rc != CMPI_RC_OK && status.msg != nullptr && status.msg->hdl != nullptr;
    if (made == nullptr || status.rc != CMPI_RC_OK) {
        fail(hasText ? static_cast<const char*>(status.msg->hdl) : "the factory gave no interface");
    }
    return made;
}

void ProviderLibrary::failWithoutTable(const std::string& kind, const std::string& provider) const
{
    const std::string specific = factoryOf(provider, kind);
    throw failure(initFailure(fPath, provider, symbol(specific) != nullptr ? specific : factoryOf(kGeneric, kind),
                              "the interface has no function table"));
}

std::string ProviderLibrary::missingFactories(const std::string& kind, const std::string& provider) const
{
    return fPath + " defines neither " + factoryOf(provider, kind) + " nor " + factoryOf(kGeneric, kind);
}

std::string findProviderLibrary(const std::vector<std::string>& directories, const std::string& location,
                                const std::string& moduleName)
{
    const std::string file = "lib" + location + ".so";
    for (const std::string& directory : directories) {
        std::string path = directory + "/" + file;
        if (::access(path.c_str(), F_OK) == 0) {
            return path;
        }
    }
    throw failure("File \"" + file + "\" was not found for provider module \"" + moduleName + "\".");
}

} // namespace Pegasus::cmpi
