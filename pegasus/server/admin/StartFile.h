#pragma once

#include <optional>
#include <string>

#include <sys/types.h>

namespace Pegasus::server {

// The file under /var/tmp that says which process serves one consumer: the process id in decimal, one newline.
//
// The path is fixed by the programs that look for it. It lies in a folder that everybody may write to, so what it names
// is believed only if that process exists and is called cimserver.
class StartFile
{
  public:
    explicit StartFile(const std::string& consumer);

    const std::string& path() const { return fPath; }

    // Throws: std::system_error.
    void write(pid_t pid) const;

    // Removes the file if it names `pid`.
    void removeIfOf(pid_t pid) const noexcept;

    // Returns: the process id in the file, if there is one.
    std::optional<pid_t> pid() const;

    // Returns: the process id in the file, if it is a living cimserver (a zombie is not).
    std::optional<pid_t> runningServer() const;

  private:
    std::string fPath;
};

} // namespace Pegasus::server
