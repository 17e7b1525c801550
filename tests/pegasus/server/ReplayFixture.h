// SPDX-License-Identifier: MIT
#pragma once

#include "tests/pegasus/server/RecordedExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <gtest/gtest.h>

#include <map>
#include <set>

namespace servertest {

// A CMPI instance is born with its class's default values; the recorded
// providers' instances lacked them.
enum class Defaults
{
    kKept,
    kLeftOut
};

// A server for recorded requests. Skips visibly where the recordings are
// missing. What a recording needs on the server (namespaces, declarations,
// classes, instances) is made of the other recordings' answers.
class ReplayFixture : public testing::Test
{
  protected:
    void SetUp() override;

    HttpAnswer replay(const RecordedExchange& recorded) const { return exchange(fTree.port(), recorded.request); }
    // The answer to a recorded request must be the recorded one, or a row of the
    // table says why ours is better. The exchange then counts as evaluated.
    void expectRecorded(const RecordedExchange& recorded, Order order = Order::kAsSent) const;
    // Counts the exchange as one that cannot be evaluated.
    static void skip(const RecordedExchange& recorded, const std::string& reason);

    // Sends an intrinsic request. Returns: whether it succeeded.
    bool send(const std::string& method, const std::string& nameSpace, const std::string& parameters) const;
    void createNamespace(const std::string& name) const;
    // Those of the namespace's recorded answers, or else those that a body uses.
    void declareQualifiers(const std::string& nameSpace, const std::string& body) const;
    // From the text of a CLASS element. Returns: whether it could be created.
    bool createClass(const std::string& nameSpace, const std::string& cimClass) const;
    // All of a recorded answer, as they were created, before the repository
    // filled in the rest. One that is there already stays.
    void createInstances(const RecordedExchange& recorded) const;
    // The namespaces of the recordings, but the server's own, with every class
    // whose own elements a recorded answer shows. Leaves out those that a
    // recorded request creates.
    void createRecordedSchema(Defaults defaults = Defaults::kKept);
    bool isCreated(const std::string& nameSpace, const std::string& name) const;

    ServerTree fTree;

  private:
    std::map<std::string, std::set<std::string>> fClasses; // by namespace; lower case
};

// The server's own namespaces.
bool isServersOwn(const std::string& nameSpace);
struct Registration
{
    std::string nameSpace;
    std::string className;
    std::string module;
};
// The registrations that a recorded answer lists, by "namespace:class" in lower
// case.
const std::map<std::string, Registration>& registeredClasses();
// The class that it asks about has a provider.
bool isRegistered(const RecordedExchange& recorded);
// A provider answered: that of the class, or those of classes below it.
bool isOfProviders(const RecordedExchange& recorded);

} // namespace servertest
