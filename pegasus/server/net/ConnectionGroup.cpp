// SPDX-License-Identifier: MIT
#include "pegasus/server/net/ConnectionGroup.h"

#include "pegasus/server/admin/Log.h"

#include <memory>
#include <system_error>
#include <thread>

namespace Pegasus::server {

bool ConnectionGroup::serve(base::Descriptor& socket, std::size_t most)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fStreams.size() >= most || fEnding) {
        return false;
    }
    auto stream = std::make_unique<SocketStream>(base::Descriptor());
    const auto entry = fStreams.insert(stream.get()).first;
    try {
        // The thread waits for the lock before it looks at the stream.
        std::thread([this, raw = stream.get()] { run(*raw); }).detach();
    } catch (const std::exception& error) {
        fStreams.erase(entry);
        Log::write(LogLevel::kError, std::string("cannot start a thread for a connection: ") + error.what());
        return false;
    }
    *stream.release() = SocketStream(std::move(socket));
    return true;
}

void ConnectionGroup::run(SocketStream& stream)
{
    {
        const std::lock_guard<std::mutex> lock(fMutex); // until serve() has put the socket in
    }
    const std::unique_ptr<SocketStream> owner(&stream);
    serveConnection(stream, fHandler, fSettings, CimAnswer::Envelope::kMessage);
    const std::lock_guard<std::mutex> lock(fMutex);
    fStreams.erase(&stream);
    fChanged.notify_all();
}

void ConnectionGroup::endReading()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fEnding = true;
    for (SocketStream* stream : fStreams) {
        stream->shutDownReading();
    }
}

void ConnectionGroup::breakAll()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    for (SocketStream* stream : fStreams) {
        stream->shutDown();
    }
}

bool ConnectionGroup::waitForEnd(const base::Deadline& deadline)
{
    std::unique_lock<std::mutex> lock(fMutex);
    return fChanged.wait_until(lock, deadline.time(), [&] { return fStreams.empty(); });
}

} // namespace Pegasus::server
