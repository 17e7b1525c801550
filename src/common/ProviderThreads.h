#pragma once

#include <boost/function.hpp>

#include <vector>

namespace NKOLVRX20 {

// Returns: whether the host's settings ask for a thread for each provider.
bool IsMultiThreaded();

// Runs every task on a thread of its own and waits for all of them.
// Requires: tasks that throw nothing.
// Throws: boost::thread_resource_error when a thread cannot be made; those that run have ended by then.
// Blocks: until the last task ends; an interruption of the calling thread does not shorten it.
void RunOnThreads(const std::vector<boost::function<void()>>& tasks);

} // namespace NKOLVRX20
