// What the plug-in asks the file system, without exceptions.
#pragma once

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace NKOLVRX20 {

bool IsDirectory(const std::string& path);
bool IsRegularFile(const std::string& path);

// Appends the names of all entries, "." and ".." too, in the directory's order.
// Returns: false when the directory cannot be opened.
bool ReadDirectory(const std::string& path, std::vector<std::string>& names);

struct TFileCloser
{
    void operator()(std::FILE* file) const { static_cast<void>(std::fclose(file)); }
};
using TFile = std::unique_ptr<std::FILE, TFileCloser>;

// Opens a regular file for reading, close-on-exec; anything else (a pipe could block for ever) counts as not there.
// Returns: null when it cannot be opened.
TFile OpenRegularFile(const std::string& path);

// Opens a file in a directory where other users may write, so that nothing of theirs is read: a regular file that
// belongs to root or to the user of this process, not reached through a link as its last part. Close-on-exec.
// Returns: null when it cannot be opened or is something else; the reason then says why, and is empty when there is
// no such file.
// Blocks: never, whatever lies there.
TFile OpenOwnFile(const std::string& path, std::string& reason);

} // namespace NKOLVRX20
