// SPDX-License-Identifier: MIT
#pragma once

#include <filesystem>
#include <string>

namespace NKOLVRX20 {

// A directory of its own below the temporary directory; gone with the object.
class TTempTree
{
  public:
    TTempTree();
    ~TTempTree();

    TTempTree(const TTempTree&) = delete;
    TTempTree& operator=(const TTempTree&) = delete;

    std::string Path() const { return fPath.string(); }
    // Writes a file, and the directories above it. Returns: its full path.
    std::string Write(const std::string& relativePath, const std::string& content) const;
    // Makes a directory. Returns: its full path.
    std::string MakeDirectory(const std::string& relativePath) const;

  private:
    std::filesystem::path fPath;
};

// Returns: the file's bytes; empty for an unreadable file.
std::string ReadWholeFile(const std::string& path);

} // namespace NKOLVRX20
