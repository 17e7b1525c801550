// SPDX-License-Identifier: MIT
#include "src/namespace/ProviderThreads.h"

#include "src/common/CoreLog.h"
#include "src/provider/TPEGASUSProvider.h"

#include <host/TConfig.h>

#include <boost/bind/bind.hpp>
#include <boost/thread/thread.hpp>

namespace NKOLVRX20 {

namespace {

// The body of a thread. An exception that left it would end the host's process.
void RunForProvider(const char* operation, const boost::shared_ptr<TPEGASUSProvider>& provider,
                    const TProviderTask& task)
{
    try {
        task(provider);
    } catch (...) {
        LogCaughtException(operation, " failed for provider ", provider->GetPath(), ": ");
    }
}

} // namespace

bool IsMultiThreaded()
{
    return TConfig::GetInstance()->getValue("pegasus_multi_thread") == "on";
}

void RunOnThreads(const char* operation, const std::vector<boost::shared_ptr<TPEGASUSProvider>>& providers,
                  const TProviderTask& task)
{
    // Joining is an interruption point, and an early exit would abandon running threads.
    const boost::this_thread::disable_interruption uninterrupted;
    boost::thread_group threads;
    try {
        for (const auto& provider : providers) {
            threads.create_thread(boost::bind(&RunForProvider, operation, provider, task));
        }
    } catch (...) {
        threads.join_all();
        throw;
    }
    threads.join_all();
}

} // namespace NKOLVRX20
