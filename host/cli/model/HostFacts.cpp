// SPDX-License-Identifier: MIT
#include "host/cli/model/Document.h"

#include <chrono>
#include <cstdio>
#include <ctime>
#include <fstream>

#include <unistd.h>

namespace vrxhost {
namespace {

std::string FirstLine(const char* path)
{
    std::string line;
    std::ifstream file(path);
    std::getline(file, line);
    return line.substr(0, line.find_last_not_of(' ') + 1);
}

} // namespace

THostFacts ReadHostFacts()
{
    char name[256] = "";
    ::gethostname(name, sizeof name - 1);
    const std::string vendor = FirstLine("/sys/class/dmi/id/sys_vendor");
    const std::string product = FirstLine("/sys/class/dmi/id/product_name");
    return {name, FirstLine("/etc/machine-id"), vendor + (vendor.empty() || product.empty() ? "" : " ") + product,
            FirstLine("/sys/class/dmi/id/product_serial")};
}

std::string TimeNow()
{
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    const auto milliseconds = std::chrono::duration_cast<std::chrono::milliseconds>(now).count();
    const std::time_t seconds = milliseconds / 1000;
    std::tm parts = {};
    ::gmtime_r(&seconds, &parts);
    char date[32];
    std::strftime(date, sizeof date, "%Y-%m-%dT%H:%M:%S", &parts);
    char text[48];
    std::snprintf(text, sizeof text, "%s.%03dZ", date, static_cast<int>(milliseconds % 1000));
    return text;
}

} // namespace vrxhost
