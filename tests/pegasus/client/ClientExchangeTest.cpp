#include "support/PeerAnswers.h"

#include <Pegasus/Client/CIMClient.h>

#include <gtest/gtest.h>

using namespace Pegasus;

namespace {

constexpr const char* kNameSpace = "root/cimv2";

CIMClass fanClass()
{
    CIMClass fan("T_Fan", "CIM_Fan");
    CIMProperty id("DeviceID", CIMValue(CIMTYPE_STRING, false));
    id.addQualifier(CIMQualifier("Key", CIMValue(true), CIMFlavor::DEFAULTS));
    fan.addProperty(id);
    fan.addProperty(CIMProperty("Speed", CIMValue(CIMTYPE_UINT64, false)));
    return fan;
}

CIMInstance fan(const char* id, Uint64 speed)
{
    CIMInstance instance("T_Fan");
    instance.addProperty(CIMProperty("DeviceID", String(id)));
    instance.addProperty(CIMProperty("Speed", CIMValue(speed)));
    instance.setPath(instance.buildPath(fanClass()));
    return instance;
}

void connect(CIMClient& client, const test::ScriptedPeer& peer)
{
    client.setTimeout(5000);
    client.connect("127.0.0.1", peer.port(), String(), String());
}

} // namespace

TEST(ClientExchange, ReadsClassesAndInstancesOverOneConnection)
{
    test::ServedModel model;
    model.addClass(kNameSpace, fanClass()).addInstance(kNameSpace, fan("a", 1)).addInstance(kNameSpace, fan("b", 2));
    test::ScriptedPeer peer(model.handler());
    CIMClient client;
    connect(client, peer);

    EXPECT_TRUE(client.getClass(kNameSpace, "t_fan", false).identical(fanClass()));
    const Array<CIMInstance> fans = client.enumerateInstances(kNameSpace, "T_Fan", false);
    ASSERT_EQ(fans.size(), 2u);
    EXPECT_TRUE(fans[1].identical(fan("b", 2)));
    EXPECT_EQ(peer.connectionCount(), 1u);
}
