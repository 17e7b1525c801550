#pragma once

#include "tests/pegasus/server/RecordedExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>

namespace servertest {

// A CMPI instance is born with its class's default values; the recorded providers' instances lacked them.
enum class Defaults
{
    kKept,
    kLeftOut
};

// A server for recorded requests. Skips visibly where the recordings are missing.
class ReplayFixture : public testing::Test
{
  protected:
    void SetUp() override;

    HttpAnswer replay(const std::string& name) const { return exchange(fTree.port(), RecordedExchange(name).request); }
    // The answer to a recorded request must be the recorded one, or a row of the table says why ours is better.
    void expectRecorded(const std::string& name, Order order = Order::kAsSent) const;

    // Sends an intrinsic request that must succeed.
    void send(const std::string& method, const std::string& nameSpace, const std::string& parameters) const;
    void createNamespace(const std::string& name) const;
    // With the recordings' declarations.
    void declareQualifiers(const std::string& nameSpace) const;
    // As the uses in a body have them.
    void declareUsedQualifiers(const std::string& nameSpace, const std::string& body) const;
    // From the text of a CLASS element.
    void createClass(const std::string& nameSpace, const std::string& cimClass) const;
    void createClasses(const std::string& nameSpace, const std::string& recordedAnswer,
                       Defaults defaults = Defaults::kKept) const;
    // From the text of an INSTANCE element, and from all of a recorded answer, as they were
    // created, before the repository filled in the rest.
    void createInstance(const std::string& nameSpace, const std::string& instance) const;
    void createInstances(const std::string& nameSpace, const std::string& recordedAnswer) const;
    // The classes of root/cimv2 that the recordings ask about, built from the recorded answers about them.
    void createRecordedSchema(Defaults defaults = Defaults::kKept) const;

    ServerTree fTree;
};

} // namespace servertest
