// SPDX-License-Identifier: MIT
#include "tests/providers/FixtureTree.h"

#include <fstream>
#include <stdexcept>

#include <stdlib.h>

namespace lnx {

FixtureTree::FixtureTree()
{
    std::string name = (std::filesystem::temp_directory_path() / "lnx-fixture-XXXXXX").string();
    if (::mkdtemp(name.data()) == nullptr) {
        throw std::runtime_error("mkdtemp " + name);
    }
    fRoot = name;
}

FixtureTree::~FixtureTree()
{
    std::error_code ignored;
    std::filesystem::remove_all(fRoot, ignored);
}

FixtureTree& FixtureTree::file(const std::string& path, const std::string& text)
{
    const std::filesystem::path full = fRoot.string() + path;
    std::filesystem::create_directories(full.parent_path());
    std::ofstream(full, std::ios::binary) << text;
    return *this;
}

FixtureTree& FixtureTree::directory(const std::string& path)
{
    std::filesystem::create_directories(fRoot.string() + path);
    return *this;
}

FixtureTree& FixtureTree::permanentAddress(const std::string& interface, const std::vector<std::uint8_t>& octets)
{
    fPermanentAddresses[interface] = octets;
    return *this;
}

FixtureTree& FixtureTree::ipAddresses(const std::string& interface, const std::vector<std::string>& addresses)
{
    fIpAddresses[interface] = addresses;
    return *this;
}

SystemTree FixtureTree::tree() const
{
    const auto lookUp = [](const auto& map) {
        return [&map](const std::string& interface) {
            const auto found = map.find(interface);
            return found == map.end() ? decltype(found->second)() : found->second;
        };
    };
    return SystemTree(fRoot.string(), lookUp(fPermanentAddresses), lookUp(fIpAddresses));
}

} // namespace lnx
