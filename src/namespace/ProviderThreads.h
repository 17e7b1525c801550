// SPDX-License-Identifier: MIT
#pragma once

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <vector>

namespace NKOLVRX20 {

class TPEGASUSProvider;

// Returns: whether the host's settings ask for a thread for each provider.
bool IsMultiThreaded();

using TProviderTask = boost::function<void(const boost::shared_ptr<TPEGASUSProvider>&)>;

// Runs the task for every provider, each on a thread of its own, and waits for all of them. What a task throws is
// logged under the operation's name, with the provider.
// Throws: boost::thread_resource_error when making a thread fails; those that run have ended by then.
// Blocks: until the last task ends; interruption of the calling thread is disabled meanwhile.
void RunOnThreads(const char* operation, const std::vector<boost::shared_ptr<TPEGASUSProvider>>& providers,
                  const TProviderTask& task);

} // namespace NKOLVRX20
