// SPDX-License-Identifier: MIT
// What the plug-in asks the file system; failures are return values.
#pragma once

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace NKOLVRX20 {

bool IsDirectory(const std::string& path);
bool IsRegularFile(const std::string& path);

// Appends the names of all entries, "." and ".." too, in the directory's order.
// Returns: false when opening the directory fails.
bool ReadDirectory(const std::string& path, std::vector<std::string>& names);

struct TFileCloser
{
    void operator()(std::FILE* file) const { static_cast<void>(std::fclose(file)); }
};
using TFile = std::unique_ptr<std::FILE, TFileCloser>;

// Opens a regular file for reading, close-on-exec; anything else (a pipe could block for ever) counts as absent.
// Returns: null when it is absent or opening it fails.
TFile OpenRegularFile(const std::string& path);

// Opens a file in a directory where other users may write, and refuses theirs: it must be a regular file that belongs
// to root or to the user of this process, and the last part of its path must be the file itself rather than a link.
// Close-on-exec.
// Returns: null when opening it fails or it is refused; the reason then says why, and is empty when the file is absent.
// Blocks: never, whatever lies there.
TFile OpenOwnFile(const std::string& path, std::string& reason);

// Writes a file that every user may read: mode 0644 whatever the process's umask is. The content of a regular file is
// replaced; a symbolic link and anything else is left alone.
// Returns: false when opening or writing it fails, or it is left alone.
// Blocks: never, whatever lies there.
bool WritePublicFile(const std::string& path, const std::string& content);

} // namespace NKOLVRX20
