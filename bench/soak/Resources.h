// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include <sys/types.h>

namespace soak {

// What this process holds at a moment.
struct TResources
{
    std::size_t fDescriptors;
    std::size_t fHeapBytes; // in use, as the allocator counts
    std::size_t fResidentBytes;
};

TResources TakeResources();

// Returns: the processes that run a program of the tree.
std::vector<pid_t> ProcessesOf(const std::string& root);

// Returns: the process that the consumer's start file names, if it runs a program of the tree; else 0.
pid_t ServerProcess(const std::string& root, const std::string& consumer);

std::string StartFile(const std::string& consumer);

} // namespace soak
