#include "pegasus/server/admin/Housekeeper.h"

namespace Pegasus::server {

Housekeeper::Housekeeper(std::chrono::milliseconds interval, std::function<void()> work)
{
    fThread = std::thread([this, interval, work = std::move(work)] {
        std::unique_lock<std::mutex> lock(fMutex);
        while (!fChanged.wait_for(lock, interval, [&] { return fEnded; })) {
            lock.unlock();
            work();
            lock.lock();
        }
    });
}

Housekeeper::~Housekeeper()
{
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fEnded = true;
    }
    fChanged.notify_all();
    fThread.join();
}

} // namespace Pegasus::server
