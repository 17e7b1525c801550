#include "src/common/ProviderThreads.h"

#include <host/TConfig.h>

#include <boost/thread/thread.hpp>

namespace NKOLVRX20 {

bool IsMultiThreaded()
{
    return TConfig::GetInstance()->getValue("pegasus_multi_thread") == "on";
}

void RunOnThreads(const std::vector<boost::function<void()>>& tasks)
{
    // Joining is an interruption point, and leaving it early would leave threads behind.
    const boost::this_thread::disable_interruption uninterrupted;
    boost::thread_group threads;
    try {
        for (const boost::function<void()>& task : tasks) {
            threads.create_thread(task);
        }
    } catch (...) {
        threads.join_all();
        throw;
    }
    threads.join_all();
}

} // namespace NKOLVRX20
