// SPDX-License-Identifier: MIT
#pragma once

#include "tests/pegasus/server/ServerTree.h"

#include <Pegasus/Client/CIMClient.h>

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace servertest {

// The namespace of the probe provider's classes.
extern const Pegasus::CIMNamespaceName kNamespace;

// A server with the probe provider, and a client of it.
class AgentTest : public testing::Test
{
  protected:
    void start(const std::vector<std::string>& properties = {});
    void connect(Pegasus::CIMClient& client) const;

    // Returns: the number that the method returns.
    static Pegasus::Uint32
    call(Pegasus::CIMClient& client, const char* className, const char* method,
         const Pegasus::Array<Pegasus::CIMParamValue>& in = Pegasus::Array<Pegasus::CIMParamValue>());
    Pegasus::Uint32 countOf(const char* className, Pegasus::Boolean deep = true);
    void setCount(Pegasus::Uint32 count);

    // Returns: the error's text.
    template <typename Action> static std::string errorOf(const Action& action)
    {
        try {
            action();
        } catch (const Pegasus::Exception& error) {
            return std::string(error.getMessage().getCString());
        }
        return "no error";
    }

    ServerTree fTree;
    Pegasus::CIMClient fClient;
};

} // namespace servertest
