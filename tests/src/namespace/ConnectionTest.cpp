// SPDX-License-Identifier: MIT
// Tries and attempts against a server that refuses first.
#include "src/provider/TPEGASUSProvider.h"
#include "tests/src/support/NamespaceRig.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/TVRXException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <dlfcn.h>

namespace {

bool gSettingsFail = false;

} // namespace

// In front of the client library's own.
void Pegasus::CIMClient::setTimeout(Uint32 timeoutMs)
{
    if (gSettingsFail) {
        throw Exception("no memory");
    }
    using TFunction = void (*)(CIMClient*, Uint32);
    static const auto fgNext = reinterpret_cast<TFunction>(::dlsym(RTLD_NEXT, "_ZN7Pegasus9CIMClient10setTimeoutEj"));
    fgNext(this, timeoutMs);
}

namespace NKOLVRX20 {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class ConnectionTest : public ::testing::Test
{
  protected:
    std::string Refusal() const
    {
        return "Cannot connect to 127.0.0.1:" + std::to_string(fServer.Port()) + ". Connection failed.";
    }

    TFakeCimServer fServer;
    TNamespaceRig fRig;
};

// The same policy for both owners; only the texts differ.
struct TOwnerTexts
{
    const char* fName;
    const char* fEnter;
    const char* fSucceeded;
    const char* fFailed;
};
constexpr TOwnerTexts kNamespaceTexts = {"namespace", "3|TPEGASUSNamespace::connect enter",
                                         "3|TPEGASUSNamespace::connect succeeded \n",
                                         "3|TPEGASUSNamespace::connect failed: "};
constexpr TOwnerTexts kProviderTexts = {"provider", "3|TPEGASUSProvider::connect enter",
                                        "3|TPEGASUSProvider::connect succeeded ",
                                        "3|TPEGASUSProvider::connect failed: "};

TEST_F(ConnectionTest, TriesThreeTimesWithAPauseAfterEachFailure)
{
    const auto ns = fRig.MakeNamespace();
    for (const TOwnerTexts& texts : {kNamespaceTexts, kProviderTexts}) {
        for (int refusals = 0; refusals <= 3; ++refusals) {
            SCOPED_TRACE(texts.fName + std::string(" refused ") + std::to_string(refusals));
            const bool isProvider = texts.fName == std::string("provider");
            TPEGASUSProvider provider;
            const auto owner = fRig.MakeNamespace();
            const auto connect = [&] {
                if (isProvider) {
                    provider.connectPegasusClient("127.0.0.1", fServer.Port(), "", "");
                } else {
                    owner->connect("127.0.0.1", fServer.Port(), "", "");
                }
            };
            isProvider ? provider.initPegasusClient() : owner->Init();
            fServer.Refuse();
            fRig.fLog.Take();
            fRig.fWorld.Take();
            int pauses = 0;
            fRig.fWorld.fOnSleep = [&](unsigned int seconds) {
                EXPECT_EQ(1U, seconds);
                if (++pauses == refusals) {
                    fServer.Listen();
                }
            };
            if (refusals == 0) {
                fServer.Listen();
            }
            if (refusals == 3) {
                fRig.fWorld.fOnSleep = nullptr;
            }

            EXPECT_EQ(refusals == 3 ? 42U : 0U, StatusOf(connect));
            std::vector<std::string> log = {texts.fEnter};
            for (int failed = 1; failed <= refusals; ++failed) {
                log.push_back(texts.fFailed + Refusal() + " try to reconnect " + std::to_string(failed));
            }
            if (refusals < 3) {
                log.push_back(texts.fSucceeded);
            }
            EXPECT_EQ(log, fRig.fLog.Lines());
            EXPECT_EQ(static_cast<std::size_t>(refusals), fRig.fWorld.Traced("sleep").size());
            const Pegasus::CIMClient& client = isProvider ? *provider.getPegClient() : *owner->getPegClient();
            EXPECT_EQ(65535000U, client.getTimeout());
            EXPECT_EQ(refusals < 3, isProvider ? provider.isConnected() : owner->isConnected());
            if (refusals == 3) {
                continue;
            }

            fRig.fLog.Take();
            EXPECT_EQ(0U, StatusOf(connect)); // once is enough
            EXPECT_THAT(fRig.fLog.Lines(), IsEmpty());
            fRig.fWorld.fOnSleep = nullptr;
        }
    }
}

TEST_F(ConnectionTest, InitMakesOneClientAndGivesItTheShortTimeOut)
{
    const auto ns = fRig.MakeNamespace();
    EXPECT_EQ(nullptr, ns->getPegClient());
    ns->Init();
    Pegasus::CIMClient* client = ns->getPegClient();
    ASSERT_NE(nullptr, client);
    EXPECT_EQ(10000U, client->getTimeout());
    client->setTimeout(1);
    ns->Init();
    EXPECT_EQ(client, ns->getPegClient());
    EXPECT_EQ(10000U, client->getTimeout());
}

TEST_F(ConnectionTest, AClientThatCannotBeSetUpIsAConnectionFailure)
{
    TPEGASUSProvider provider;
    const auto ns = fRig.MakeNamespace();
    gSettingsFail = true;
    EXPECT_EQ(42U, StatusOf([&] { ns->Init(); }));
    EXPECT_EQ(42U, StatusOf([&] { provider.initPegasusClient(); }));
    gSettingsFail = false;
    EXPECT_THAT(fRig.fLog.Lines(), ElementsAre("3|TPEGASUSNamespace:Pegasus Client Creation Fail: no memory",
                                               "3|TPEGASUSProvider: Pegasus Client Creation Fail: no memory"));
}

TEST_F(ConnectionTest, SucceedsAtWhicheverAttemptTheServerAppears)
{
    for (int attempt = 1; attempt <= 6; ++attempt) {
        for (int failedTries = 0; failedTries < 3; ++failedTries) {
            SCOPED_TRACE("attempt " + std::to_string(attempt) + ", try " + std::to_string(failedTries + 1));
            fServer.Refuse();
            fRig.OfferPortOf(fServer);
            int starts = 0, pausesSinceStart = 0;
            fRig.fWorld.fRun = [&](const TSpawnCall& call, std::string&) {
                if (call.fName == "cimserver" && call.fArguments.size() == 2) {
                    ++starts;
                    pausesSinceStart = 0;
                }
            };
            // One pause follows the start itself, then one each failed try.
            fRig.fWorld.fOnSleep = [&](unsigned int) {
                if (starts == attempt && pausesSinceStart++ == failedTries) {
                    fServer.Listen();
                }
            };
            fRig.fLog.Take();
            const auto ns = fRig.MakeNamespace();
            ns->Initialize(fRig.Context());
            EXPECT_TRUE(ns->isConnected());
            EXPECT_EQ(attempt, starts);
            EXPECT_EQ(static_cast<std::size_t>(3 * (attempt - 1) + failedTries),
                      fRig.fLog.LinesWith("3|TPEGASUSNamespace::connect failed: ").size());
            fRig.fWorld.fOnSleep = nullptr;
            fRig.fWorld.fRun = nullptr;
        }
    }
}

TEST_F(ConnectionTest, ACompleteStartRunsItsStepsInOrder)
{
    fRig.OfferPortOf(fServer);
    fServer.Listen();
    auto ns = fRig.MakeNamespace();
    fRig.fWorld.fRun = [&](const TSpawnCall& call, std::string&) {
        EXPECT_TRUE(call.fName != "cimmof" || ns->GetRootClass()); // the root class comes first
    };
    ns->Initialize(fRig.Context());
    ns.reset();
    fRig.fWorld.fRun = nullptr;
    const std::vector<std::string> wipe = {"system " + RemovalOf("R/pegasus/repository"),
                                           "system " + RemovalOf("R/pegasus/provider/lsi_mir/repository.xml")};
    const std::vector<std::string> kill = {"sleep 3", "system " + RemovalOf("START", "-f")};
    std::vector<std::string> life = wipe;
    life.insert(life.end(), kill.begin(), kill.end());
    life.insert(life.end(),
                {"run cimserver httpPort=" + std::to_string(fServer.Port()) + " enableHttpsConnection=false", "sleep 1",
                 "run cimmof -n root/PG_Internal -aE M/pegasus/pegSchema/PG_Internal/PG_Internal.mof",
                 "run cimmof -n root/PG_InterOp -aE M/pegasus/pegSchema/PG_InterOp/PG_InterOp.mof",
                 "run cimconfig -s providerDir=", "system " + RemovalOf("/lsi_mr.conf"), "run bcu -v",
                 "system " + RemovalOf("R/pegasus/provider/brocade/libdbfaj.so"), "run cimserver -s"});
    life.insert(life.end(), kill.begin(), kill.end());
    life.insert(life.end(), wipe.begin(), wipe.end());
    EXPECT_EQ(life, fRig.Abbreviate(fRig.fWorld.Trace()));
}

} // namespace
} // namespace NKOLVRX20
