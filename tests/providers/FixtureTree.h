// SPDX-License-Identifier: MIT
#pragma once

#include "providers/linux/SystemTree.h"

#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace lnx {

// An invented machine: files below a temporary root, removed at the end, and the permanent addresses of its ports.
class FixtureTree
{
  public:
    FixtureTree();
    ~FixtureTree();
    FixtureTree(const FixtureTree&) = delete;
    FixtureTree& operator=(const FixtureTree&) = delete;

    // `path` begins with a slash; its directories are made.
    FixtureTree& file(const std::string& path, const std::string& text);
    FixtureTree& directory(const std::string& path);
    FixtureTree& permanentAddress(const std::string& interface, const std::vector<std::uint8_t>& octets);

    FixtureTree& ipAddresses(const std::string& interface, const std::vector<std::string>& addresses);

    // The tree reads the fixture, which must outlive it.
    SystemTree tree() const;
    const std::filesystem::path& root() const { return fRoot; }

  private:
    std::filesystem::path fRoot;
    std::map<std::string, std::vector<std::uint8_t>> fPermanentAddresses;
    std::map<std::string, std::vector<std::string>> fIpAddresses;
};

} // namespace lnx
