// SPDX-License-Identifier: MIT
#pragma once

#include "src/instance/TPEGASUSInstance.h"
#include "tests/src/schema/ServedNamespace.h"

#include <host/ICIMProperty.h>

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace NKOLVRX20 {

using TInstances = std::vector<boost::shared_ptr<TPEGASUSInstance>>;

inline Pegasus::CIMInstance Instance(const char* className, const std::string& path,
                                     const std::vector<Pegasus::CIMProperty>& properties)
{
    Pegasus::CIMInstance instance{Pegasus::CIMName(className)};
    for (const Pegasus::CIMProperty& property : properties) {
        instance.addProperty(property);
    }
    instance.setPath(Pegasus::CIMObjectPath(Pegasus::String(path.c_str())));
    return instance;
}

// A server with one class and its instances, and the ways to ask for them.
class TRetrievalFixture : public ::testing::Test
{
  protected:
    // Returns: the class, whose log lines so far are forgotten.
    boost::shared_ptr<TPEGASUSClass> Serve(const char* name, const std::vector<Pegasus::CIMInstance>& instances,
                                           const std::string& timeout = "60")
    {
        fServed.fModel.addClass(kNsp, Pegasus::CIMClass(Pegasus::CIMName(name)));
        for (const Pegasus::CIMInstance& instance : instances) {
            fServed.fModel.addInstance(kNsp, instance);
        }
        const auto made = fServed.Class(name, timeout);
        fServed.Log();
        fServed.TakeRequests();
        return made;
    }

    static TInstances Enumerate(TPEGASUSClass& target, std::size_t limit = 99)
    {
        TInstances instances;
        target.EnumerateInstances(
            [&](const boost::shared_ptr<ICIMInstance>& instance) {
                instances.push_back(boost::dynamic_pointer_cast<TPEGASUSInstance>(instance));
                return instances.size() < limit;
            },
            true, {});
        return instances;
    }

    static TCIMValue ValueOf(const ICIMInstance& instance, const char* name)
    {
        return instance.GetProperty(name, {})->GetValue({});
    }

    static TCIMReference ReferenceTo(const std::string& path)
    {
        TCIMReference reference;
        reference.SetPath(path);
        return reference;
    }

    void FailNext(const char* operation, unsigned int code, const char* text)
    {
        fServed.fModel.addFault(
            operation, [=](const test::PeerRequest& request) { return test::errorAnswer(request, code, text); });
    }

    TServedNamespace fServed;
};

} // namespace NKOLVRX20
