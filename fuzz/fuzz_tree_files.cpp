// SPDX-License-Identifier: MIT
// The files of a server's tree: the first byte of an input selects configuration, lock or start file. What was read is
// written and read again unchanged; a start file that names another process stays.
#include "pegasus/base/TreeLockFile.h"
#include "pegasus/server/admin/Config.h"
#include "pegasus/server/admin/StartFile.h"

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <tuple>

#include <fcntl.h>
#include <unistd.h>

using namespace Pegasus;

namespace {

// In memory where that is possible; removed at the end.
class Home
{
  public:
    Home()
    {
        std::string path = ::access("/dev/shm", W_OK) == 0 ? "/dev/shm/fuzz-XXXXXX" : "/tmp/fuzz-XXXXXX";
        fPath = ::mkdtemp(path.data());
    }
    ~Home() { std::filesystem::remove_all(fPath); }
    Home(const Home&) = delete;
    Home& operator=(const Home&) = delete;

    const std::string& path() const { return fPath; }

  private:
    std::string fPath;
};

const std::string& home()
{
    static const Home fgHome;
    return fgHome.path();
}

void put(const std::string& path, std::string_view bytes)
{
    std::ofstream(path, std::ios::binary) << bytes;
}

void require(bool condition)
{
    if (!condition) {
        std::abort();
    }
}

void configuration(std::string_view bytes)
{
    const std::string path = server::plannedConfigPath(home());
    put(path, bytes);
    const server::ConfigValues values = server::readConfigFile(path);
    const server::Config config(home());
    for (const server::ConfigProperty& property : server::configTable()) {
        const std::string value = config.text(property.name);
        require(value == property.defaultValue || server::isValidConfigValue(property, value, home()));
    }
    server::writeConfigFile(path, values);
    require(server::readConfigFile(path) == values);
}

auto fields(const base::TreeLockRecord& record)
{
    return std::tie(record.pid, record.port, record.startFile, record.repository, record.device, record.inode);
}

void lock(std::string_view bytes)
{
    const std::string path = base::treeLockPath(home());
    put(path, bytes);
    require(base::readTreeLock(home()).state == base::TreeLockState::kFree);
    const base::Descriptor file(::open(path.c_str(), O_RDWR | O_CLOEXEC));
    require(base::takeTreeLock(file));
    const base::TreeLockStatus status = base::readTreeLock(home());
    require(status.state == base::TreeLockState::kHeld);
    base::TreeLockRecord record = status.record;
    if (record.repository.empty()) { // a folder's device and inode go with its name
        record.device = record.inode = 0;
    }
    base::writeTreeLock(file, record);
    const base::TreeLockRecord again = base::readTreeLock(home()).record;
    require(fields(again) == fields(record));
}

void startFile(std::string_view bytes)
{
    const std::string path = home() + "/start.conf";
    put(path, bytes);
    server::StartFile::remove(path, 4711);
    require(std::filesystem::exists(path) == (bytes.substr(0, 64) != "4711\n"));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    constexpr void (*kReaders[])(std::string_view) = {configuration, lock, startFile};
    if (size != 0) {
        kReaders[data[0] % std::size(kReaders)]({reinterpret_cast<const char*>(data) + 1, size - 1});
    }
    return 0;
}
