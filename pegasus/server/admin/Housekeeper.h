#pragma once

#include <chrono>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <thread>

namespace Pegasus::server {

// Calls a function at an interval, on a thread of its own, as long as it exists.
class Housekeeper
{
  public:
    Housekeeper(std::chrono::milliseconds interval, std::function<void()> work);
    // Blocks: until a running call has returned.
    ~Housekeeper();
    Housekeeper(const Housekeeper&) = delete;
    Housekeeper& operator=(const Housekeeper&) = delete;

  private:
    std::mutex fMutex;
    std::condition_variable fChanged;
    bool fEnded = false;
    std::thread fThread;
};

} // namespace Pegasus::server
