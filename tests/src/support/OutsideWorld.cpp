// SPDX-License-Identifier: MIT
#include "tests/src/support/OutsideWorld.h"

#include <atomic>

namespace NKOLVRX20 {

namespace {

std::atomic<TOutsideWorld*> gCurrent{nullptr};

} // namespace

TOutsideWorld::TOutsideWorld()
{
    gCurrent = this;
}

TOutsideWorld::~TOutsideWorld()
{
    gCurrent = nullptr;
}

TOutsideWorld* TOutsideWorld::Current()
{
    return gCurrent;
}

std::vector<std::string> TOutsideWorld::Trace() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fTrace;
}

std::vector<std::string> TOutsideWorld::Traced(const std::string& kind) const
{
    std::vector<std::string> chosen;
    for (const std::string& entry : Trace()) {
        if (entry.compare(0, kind.size() + 1, kind + " ") == 0) {
            chosen.push_back(entry.substr(kind.size() + 1));
        }
    }
    return chosen;
}

std::vector<std::string> TOutsideWorld::Take()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<std::string> taken;
    taken.swap(fTrace);
    return taken;
}

std::vector<TSpawnCall> TOutsideWorld::Runs() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fRuns;
}

void TOutsideWorld::Forget()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fTrace.clear();
    fRuns.clear();
}

void TOutsideWorld::Record(const std::string& entry)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fTrace.push_back(entry);
}

void TOutsideWorld::Run(const TSpawnCall& call, std::string& output)
{
    std::string entry = "run " + call.fName;
    for (const std::string& argument : call.fArguments) {
        entry += " " + argument;
    }
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fTrace.push_back(entry);
        fRuns.push_back(call);
    }
    output.clear();
    if (fRun) {
        fRun(call, output);
    }
}

bool TOutsideWorld::TakeThread()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fThreadsUntilFailure == -1) {
        return true;
    }
    return fThreadsUntilFailure-- > 0;
}

} // namespace NKOLVRX20
