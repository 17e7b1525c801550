// SPDX-License-Identifier: MIT
// The host's settings file: it is read as a whole or refused as a whole, and every value that it sets can be set again.
#include <host/TConfig.h>
#include <host/TVRXException.h>

#include <cstdint>
#include <cstdlib>
#include <string>

#include <sys/mman.h>
#include <unistd.h>

using namespace NKOLVRX20;

namespace {

// Loads a file of these bytes. Returns: the status of a refusal; 0 for none.
std::uint32_t load(const std::string& bytes)
{
    const int file = ::memfd_create("settings", MFD_CLOEXEC);
    if (::write(file, bytes.data(), bytes.size()) != static_cast<ssize_t>(bytes.size())) {
        std::abort();
    }
    std::uint32_t status = 0;
    try {
        TConfig::GetInstance()->Load("/proc/self/fd/" + std::to_string(file));
    } catch (const TVRXException& error) {
        status = error.GetStatusCode();
    }
    ::close(file);
    return status;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    TConfig& config = *TConfig::GetInstance();
    config.Clear();
    if (load("pegasus_multi_thread = before\n") != 0) {
        std::abort();
    }
    const std::string bytes(reinterpret_cast<const char*>(data), size);
    const std::uint32_t status = load(bytes);
    const std::string value = config.getValue("pegasus_multi_thread");
    if (status != 0 && value != "before") {
        std::abort(); // half of a refused file
    }
    config.Clear();
    if (status == 0 &&
        (load("pegasus_multi_thread=" + value + "\n") != 0 || config.getValue("pegasus_multi_thread") != value))
    {
        std::abort();
    }
    config.Clear(); // what stays allocated makes the engine look for leaks after each input
    return 0;
}
