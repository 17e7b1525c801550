// SPDX-License-Identifier: MIT
// What a server, a property or a visitor that fails costs a retrieval.
#include "tests/src/instance/RetrievalFixture.h"

#include <host/TRootObject.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>

namespace NKOLVRX20 {
namespace {

using Pegasus::CIMName;
using Pegasus::CIMValue;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

class RetrievalFailureTest : public TRetrievalFixture
{
};

TEST_F(RetrievalFailureTest, ATimeoutSaysWhatMayBeLost)
{
    struct
    {
        const char* fClass;
        const char* fWarning;
    } const rows[] = {
        {"CIM_A", ""},
        {"VMware_HypervisorSoftwareIdentity", "(may cause 'Operating System' table lost)"},
        {"OMC_IpmiLogRecord", "(may cause 'IPMI Event' page  lost)"},
        {"VMware_ComponentSoftwareIdentity", "(may cause 'Installed Applications' page  lost)"},
        {"KOL_StandardMessageLogEntry", "(may cause 'Chassis Event log' page  lost)"},
        {"OMC_IpmiLogRecordX", ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fClass);
        const auto target = Serve(row.fClass, {});
        // While the client waits for the class, the timeout of its next question is shortened.
        fServed.fModel.addFault("GetClass", [&](const test::PeerRequest& request) {
            fServed.fNamespace->getPegClient()->setTimeout(50);
            return test::classAnswer(request, Pegasus::CIMClass(CIMName(row.fClass)));
        });
        fServed.fModel.addFault("EnumerateInstances", [](const test::PeerRequest&) { return test::noAnswer(); });
        EXPECT_THAT(Enumerate(*target), IsEmpty());
        EXPECT_EQ(std::string("0|Get Instances for: ") + row.fClass +
                      " returned ConnectionTimeoutException: connection timed out" + row.fWarning,
                  fServed.Log().back());
    }
}

TEST_F(RetrievalFailureTest, AFailedCallIsLoggedByItsKindAndYieldsNothing)
{
    const std::function<test::PeerAnswer(const test::PeerRequest&)> cimError = [](const test::PeerRequest& request) {
        return test::errorAnswer(request, 1, "CIM_ERR_FAILED: no");
    };
    const std::function<test::PeerAnswer(const test::PeerRequest&)> closed = [](const test::PeerRequest&) {
        return test::notHttp();
    };
    const char* const operations[] = {"EnumerateInstances", "GetInstance", "GetInstanceWithNsp"};
    const auto target = Serve("CIM_A", {});
    for (const std::string operation : operations) {
        for (const bool isCimError : {true, false}) {
            SCOPED_TRACE(operation + (isCimError ? " CIM error" : " not HTTP"));
            fServed.fModel.addFault("EnumerateInstances", isCimError ? cimError : closed);
            fServed.Log();
            if (operation == "EnumerateInstances") {
                EXPECT_THAT(Enumerate(*target), IsEmpty());
            } else if (operation == "GetInstance") {
                EXPECT_FALSE(target->GetInstance(ReferenceTo("x"), {}));
            } else {
                EXPECT_FALSE(target->GetInstanceWithNsp(ReferenceTo("x"), {}));
            }
            EXPECT_EQ(isCimError ? "3|DEBUG1:TPEGASUSClass::" + operation +
                                       " from Pegasus for: CIM_A returned exception: CIM_ERR_FAILED: no"
                                 : "3|TPEGASUSClass::" + operation + " from Pegasus for: CIM_A returned exception: " +
                                       "Malformed HTTP response message.",
                      fServed.Log().back());
        }
    }
}

// What the server makes of one request, and what the client library makes of that.
struct TFaultRow
{
    const char* fName;
    std::function<test::PeerAnswer(const test::PeerRequest&, const std::string& body)> fAnswer; // body: a good one
    bool fFails;
};

const TFaultRow kFaults[] = {
    {"whole", [](const auto&, const auto& body) { return test::httpAnswer(body); }, false},
    {"not HTTP", [](const auto&, const auto&) { return test::notHttp(); }, true},
    {"closed without an answer", [](const auto&, const auto&) { return test::closedConnection(); }, true},
    {"an HTTP error", [](const auto&, const auto&) { return test::httpErrorAnswer(503, "Busy"); }, true},
    {"another operation's answer",
     [](const auto& request, const auto& body) {
         std::string other = request.method();
         other.back() = 'X';
         return test::withReplaced(test::httpAnswer(body), "NAME=\"" + request.method(), "NAME=\"" + other);
     },
     true},
};

TEST_F(RetrievalFailureTest, WhateverTheServerAnswersCostsThatCallOnly)
{
    const auto target = Serve("CIM_A", {Instance("CIM_A", "CIM_A.K=1", {})});
    const std::string instance = "<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"CIM_A\"/><INSTANCE "
                                 "CLASSNAME=\"CIM_A\"/></VALUE.NAMEDINSTANCE>";
    const std::string failed = "TPEGASUSClass::EnumerateInstances from Pegasus for: CIM_A returned exception: ";
    int number = 0;
    for (const TFaultRow& row : kFaults) {
        SCOPED_TRACE(row.fName);
        fServed.fModel.addFault("EnumerateInstances", [&](const test::PeerRequest& request) {
            return row.fAnswer(request, test::intrinsicBody(request, instance));
        });
        EXPECT_EQ(row.fFails ? 0U : 1U, Enumerate(*target).size());
        EXPECT_THAT(fServed.Log().back(), ::testing::HasSubstr(row.fFails ? failed : "nsp=root/cimv2"));
        EXPECT_EQ(1U, Enumerate(*target).size()); // on a new connection, if need be

        const std::string name = "CIM_F" + std::to_string(++number);
        fServed.fModel.addClass(kNsp, Pegasus::CIMClass(CIMName(name.c_str())));
        fServed.fModel.addFault("GetClass", [&](const test::PeerRequest& request) {
            return row.fAnswer(request, test::intrinsicBody(request, "<CLASS NAME=\"" + name + "\"/>"));
        });
        try {
            EXPECT_EQ(row.fFails, fServed.Class(name) == nullptr);
        } catch (const Pegasus::UninitializedObjectException&) { // no HTTP
            EXPECT_TRUE(row.fFails);
        }
        EXPECT_TRUE(fServed.Class(name));
    }
}

TEST_F(RetrievalFailureTest, AClassThatTheServerLostIsNotEnumerated)
{
    const auto target = Serve("CIM_A", {});
    for (const std::string operation : {"EnumerateInstances", "GetInstanceWithNsp"}) {
        FailNext("GetClass", 6, "CIM_ERR_NOT_FOUND: CIM_A");
        if (operation == "EnumerateInstances") {
            EXPECT_THAT(Enumerate(*target), IsEmpty());
        } else {
            EXPECT_FALSE(target->GetInstanceWithNsp(ReferenceTo("x"), {}));
        }
        EXPECT_EQ("0|TPEGASUSClass:" + operation +
                      ". NSP :root/cimv2 Do not have class CIM_Awith pegasus exeption: CIM_ERR_NOT_FOUND: CIM_A",
                  fServed.Log().back());
    }
    EXPECT_THAT(fServed.TakeRequests(), ElementsAre("GetClass CIM_A", "GetClass CIM_A"));
}

TEST_F(RetrievalFailureTest, WithoutATimeASingleInstanceIsNotWaitedFor)
{
    const auto target = Serve("CIM_A", {}, "0");
    EXPECT_FALSE(target->GetInstance(ReferenceTo("x"), {}));
    EXPECT_EQ("3|TPEGASUSClass::GetInstance from Pegasus for: CIM_A returned exception: connection timed out",
              fServed.Log().back());
}

TEST_F(RetrievalFailureTest, WithoutAConnectionEveryOperationAnswersAsForAFailedCall)
{
    const auto target = Serve("CIM_A", {});
    target->SetProvider(boost::make_shared<TPEGASUSProvider>()); // never connected: it has no client
    EXPECT_THAT(Enumerate(*target), IsEmpty());
    EXPECT_EQ("3|TPEGASUSClass::EnumerateInstances from Pegasus for: CIM_A returned exception: not connected",
              fServed.Log().back());
    const auto unconnected = fServed.fRig.MakeNamespace();
    const auto orphan = boost::make_shared<TPEGASUSClass>(unconnected, "CIM_A", nullptr);
    EXPECT_FALSE(orphan->GetInstance(ReferenceTo("x"), {}));
    EXPECT_EQ("3|TPEGASUSClass::GetInstance from Pegasus for: CIM_A returned exception: not connected",
              fServed.Log().back());
    EXPECT_EQ(42U, StatusOf([&] { orphan->Initialize(kNsp, "60", nullptr); }));
    EXPECT_THAT(fServed.TakeRequests(), IsEmpty());
}

// Is the core logger and throws when a property is lost: the way in which a whole instance can fail.
class TFailingLogger : public ILogger
{
  public:
    explicit TFailingLogger(std::function<void()> failure) : fFailure(std::move(failure))
    {
        fReplaced = TRootObject::SetCoreLogger(this);
    }
    ~TFailingLogger() override { TRootObject::SetCoreLogger(fReplaced); }
    TFailingLogger(const TFailingLogger&) = delete;
    TFailingLogger& operator=(const TFailingLogger&) = delete;

    void Log(EVRXLogSeverity severity, const std::string& text) override
    {
        if (text.find("Unable to retrieve property") != std::string::npos) {
            fFailure();
        }
        fLines.push_back(std::to_string(severity) + "|" + text);
    }

    std::vector<std::string> fLines;

  private:
    const std::function<void()> fFailure;
    ILogger* fReplaced;
};

TEST_F(RetrievalFailureTest, AnInstanceThatCannotBeBuiltIsSkipped)
{
    const auto good = [](const char* path) { return Instance("CIM_A", path, {Property("P", CIMValue(true))}); };
    const auto target =
        Serve("CIM_A", {good("CIM_A.K=0"), Instance("CIM_A", "CIM_A.K=1", {Property("Gr\xC3\xB6n", CIMValue(true))}),
                        good("CIM_A.K=2")});
    struct
    {
        const char* fName;
        std::function<void()> fFailure;
        const char* fLine;
    } const rows[] = {
        {"Pegasus", [] { throw Pegasus::CIMException(Pegasus::CIM_ERR_FAILED, "bad"); },
         "3|DEBUG3:TPEGASUSClass::EI Error from Pegasus for: CIM_A, pegInst 1 returned exception: bad"},
        {"host", [] { throw TVRXException(14); }, "3|DEBUG2:TPEGASUSClass::EI VRX Error for: CIM_A, pegInst 1"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        TFailingLogger log(row.fFailure);
        EXPECT_EQ(2U, Enumerate(*target).size());
        EXPECT_THAT(log.fLines, ::testing::Contains(row.fLine));
        EXPECT_FALSE(target->GetInstance(ReferenceTo("CIM_A.K=1"), {}));
        EXPECT_TRUE(target->GetInstance(ReferenceTo("CIM_A.K=2"), {}));
        EXPECT_EQ(2, std::count(log.fLines.begin(), log.fLines.end(), row.fLine));
    }
}

TEST_F(RetrievalFailureTest, TheVisitorsOwnExceptionReachesTheHost)
{
    const auto target = Serve("CIM_A", {Instance("CIM_A", "CIM_A.K=1", {}), Instance("CIM_A", "CIM_A.K=2", {})});
    int visits = 0;
    EXPECT_EQ(77U, StatusOf([&] {
                  target->EnumerateInstances(
                      [&](const auto&) -> bool {
                          ++visits;
                          throw TVRXException(77);
                      },
                      true, {});
              }));
    EXPECT_EQ(1, visits);
}

} // namespace
} // namespace NKOLVRX20
