// SPDX-License-Identifier: MIT
#pragma once

#include <cmpi/cmpi.h>

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

// A small CMPI broker with the habits of OpenPegasus that punish a careless provider. An object dies at its release or
// at the end of the call, each in memory of its own, so that the address sanitizer sees a use after that; a build
// without it overwrites the object's text and reports the use. An array of CMPI_string keeps the handles of its
// elements. Values are read with exactly the bytes of their type. What the vendor of this repository does not call ends
// the test.
namespace lnx {

class BrokerObject;
struct PathContent;

struct BrokerValue
{
    CMPIType type = CMPI_null;
    bool isNull = true;
    std::string text; // numbers as their bytes in hexadecimal
    std::shared_ptr<PathContent> path;
};

using BrokerValues = std::map<std::string, BrokerValue>;

struct PathContent
{
    std::string nameSpace;
    std::string className;
    BrokerValues keys;
};

struct InstanceContent
{
    PathContent path;
    BrokerValues properties;
};

// What one call of a provider did.
struct CallReport
{
    CMPIrc code = CMPI_RC_OK;
    std::string text;
    std::vector<InstanceContent> results; // paths have no properties
    BrokerValues outputs;
    BrokerValue returned;
    bool isDone = false;
    unsigned calls = 0;              // of the broker's functions that may fail
    std::string failed;              // the function that was made to fail
    std::vector<std::string> faults; // of the provider: uses after release, objects that it left
};

class TestBroker
{
  public:
    using Call = std::function<CMPIStatus(const CMPIContext*, const CMPIResult*, CMPIArgs* out)>;

    TestBroker();
    ~TestBroker();
    TestBroker(const TestBroker&) = delete;
    TestBroker& operator=(const TestBroker&) = delete;

    const CMPIBroker* face() const { return &fFace; }

    // Runs one call; the objects that it left are freed after it. The function `failAt`, counted from 1, fails.
    CallReport run(const Call& call, unsigned failAt = 0);

    // Arguments of a call: made within it, freed with it; the provider's release of them does nothing.
    CMPIObjectPath* pathArgument(PathContent content);
    CMPIArgs* argsArgument(BrokerValues content);

    // For the table functions.
    template <typename Object> Object* make(std::unique_ptr<Object> object, bool isFromFactory);
    CMPIStatus release(BrokerObject& object);
    void use(const BrokerObject& object);
    // Returns: true when the function called `name` is to fail.
    bool fails(const char* name);
    CallReport& report() { return fReport; }

  private:
    void endFrame(const CMPIString* message);

    CMPIBroker fFace;
    CallReport fReport;
    unsigned fFailAt = 0;
    std::map<const BrokerObject*, std::unique_ptr<BrokerObject>> fLive;
    std::vector<std::unique_ptr<BrokerObject>> fReleased; // without the address sanitizer
};

} // namespace lnx
