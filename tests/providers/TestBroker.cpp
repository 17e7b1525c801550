// SPDX-License-Identifier: MIT
#include "tests/providers/TestBroker.h"

#include "tests/providers/TestBrokerObjects.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

#if defined(__SANITIZE_ADDRESS__)
#define IS_ADDRESS_SANITIZED true
#else
#define IS_ADDRESS_SANITIZED false
#endif

namespace lnx {

void unexpected()
{
    std::fputs("the test broker lacks the function that the provider calls\n", stderr);
    std::abort();
}

TestBroker::TestBroker() : fFace{this, &kUpcalls, &kFactories, &kThreads, nullptr} {}

TestBroker::~TestBroker() = default;

CMPIStatus TestBroker::release(BrokerObject& object)
{
    if (object.isArgument) {
        return kOk;
    }
    auto held = std::move(fLive.extract(&object).mapped());
    if (!IS_ADDRESS_SANITIZED) {
        held->wipe();
        held->isReleased = true;
        fReleased.push_back(std::move(held));
    }
    return kOk;
}

void TestBroker::use(const BrokerObject& object)
{
    if (object.isReleased) {
        fReport.faults.push_back(std::string("a ") + object.kind + " was used after its release");
    }
}

bool TestBroker::fails(const char* name)
{
    if (++fReport.calls != fFailAt) {
        return false;
    }
    fReport.failed = name;
    return true;
}

CMPIObjectPath* TestBroker::pathArgument(PathContent content)
{
    auto* path = make(std::make_unique<PathObject>(std::move(content)), false);
    path->isArgument = true;
    return path;
}

CMPIArgs* TestBroker::argsArgument(BrokerValues content)
{
    auto* args = make(std::make_unique<ArgsObject>(std::move(content)), false);
    args->isArgument = true;
    return args;
}

void TestBroker::endFrame(const CMPIString* message)
{
    for (const auto& [object, holder] : fLive) {
        const bool isMessage = message != nullptr && object == &static_cast<const StringObject&>(*message);
        if (object->isFromFactory && !isMessage) {
            fReport.faults.push_back(std::string("a ") + object->kind + " was left");
        }
    }
    fLive.clear();
    fReleased.clear();
}

CallReport TestBroker::run(const Call& call, unsigned failAt)
{
    fReport = {};
    fFailAt = failAt;
    auto* out = make(std::make_unique<ArgsObject>(BrokerValues()), false);
    auto* context = make(std::make_unique<ContextObject>(), false);
    auto* result = make(std::make_unique<ResultObject>(), false);
    out->isArgument = context->isArgument = result->isArgument = true;
    const CMPIStatus status = call(context, result, out);
    fReport.code = status.rc;
    if (status.msg != nullptr) {
        fReport.text = of<StringObject>(status.msg).text();
    }
    fReport.outputs = out->content;
    endFrame(status.msg);
    return fReport;
}

} // namespace lnx
