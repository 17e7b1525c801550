// SPDX-License-Identifier: MIT
#pragma once

#include "tests/pegasus/cmpi/MofServices.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace Pegasus::cmpi {

constexpr const char* kProvider = "Conformance";

// Returns: "code: text" of the call's exception, "" on success.
template <typename Call> std::string errorOf(Call&& call)
{
    try {
        call();
    } catch (const CIMException& error) {
        return std::to_string(error.getCode()) + ": " + text(error.getMessage());
    }
    return {};
}

// A module of the conformance provider, or of another library, and the services that it gets.
class Module : public testing::Test
{
  protected:
    Module() { services.compileFile(CONFORMANCE_SOURCES "/conformance.mof"); }

    void load(const char* library = CONFORMANCE_LIBRARY, const char* provider = kProvider)
    {
        name = provider;
        module = std::make_unique<ProviderModule>("tests", library, services);
        services.route(*module, name);
    }

    ProviderRequest request() const { return MofServices::request(name); }

    CIMValue invoke(const char* method, const Array<CIMParamValue>& in, Array<CIMParamValue>& out)
    {
        return module->invokeMethod(request(), CIMObjectPath(String("TST_Check")), CIMName(method), in, out);
    }

    CIMValue invoke(const char* method, const char* parameter, const CIMValue& value)
    {
        Array<CIMParamValue> in;
        Array<CIMParamValue> out;
        in.append(CIMParamValue(String(parameter), value));
        return invoke(method, in, out);
    }

    void setMode(const std::string& mode) { invoke("SetMode", "Mode", CIMValue(String(mode.c_str()))); }

    std::vector<CIMInstance> items(const CIMPropertyList& properties = CIMPropertyList())
    {
        std::vector<CIMInstance> found;
        module->enumerateInstances(request(), CIMName("TST_Item"), properties,
                                   [&](const CIMInstance& instance) { found.push_back(instance); });
        return found;
    }

    MofServices services;
    std::string name;
    std::unique_ptr<ProviderModule> module;
};

} // namespace Pegasus::cmpi
