#pragma once

#include <string>

namespace Pegasus::server {

// Which provider serves a class in a namespace.
struct ProviderReference
{
    std::string module;
    std::string provider;
    std::string location;      // of the module's library: lib<location>.so
    std::string interfaceType; // "CMPI" or "C++Default"
};

} // namespace Pegasus::server
