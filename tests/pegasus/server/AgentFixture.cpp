// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/AgentFixture.h"

namespace servertest {

using namespace Pegasus;

const CIMNamespaceName kNamespace("root/probe");

void AgentTest::start(const std::vector<std::string>& properties)
{
    fTree.start(properties);
    fTree.installProbe();
    connect(fClient);
}

void AgentTest::connect(CIMClient& client) const
{
    client.connect("127.0.0.1", fTree.port(), String(), String());
}

Uint32 AgentTest::call(CIMClient& client, const char* className, const char* method, const Array<CIMParamValue>& in)
{
    Array<CIMParamValue> out;
    Uint32 number = 0;
    client.invokeMethod(kNamespace, CIMObjectPath(className), method, in, out).get(number);
    return number;
}

Uint32 AgentTest::countOf(const char* className, Boolean deep)
{
    return fClient.enumerateInstances(kNamespace, className, deep).size();
}

void AgentTest::setCount(Uint32 count)
{
    Array<CIMParamValue> in;
    in.append(CIMParamValue("Count", CIMValue(count)));
    EXPECT_EQ(call(fClient, "Probe_Bulk", "SetCount", in), count);
}

} // namespace servertest
