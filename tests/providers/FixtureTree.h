#pragma once

#include "providers/linux/SystemTree.h"

#include <filesystem>
#include <string>

namespace lnx {

// A made-up machine: files below a temporary root, removed at the end.
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

    SystemTree tree() const { return SystemTree(fRoot.string()); }
    const std::filesystem::path& root() const { return fRoot; }

  private:
    std::filesystem::path fRoot;
};

} // namespace lnx
