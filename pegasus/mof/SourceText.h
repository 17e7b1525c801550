#pragma once

#include "pegasus/mof/MofError.h"

#include <string>
#include <vector>

namespace Pegasus::mof {

// One source file in memory. Places in it are byte offsets until somebody has to read them.
class SourceText
{
  public:
    SourceText(std::string name, std::string text) : fName(std::move(name)), fText(std::move(text)) {}

    // Throws FileError ("Can't open file <path>", "Can't read file …", a file beyond maxBytes). Refuses anything but a
    // regular file or a pipe.
    static SourceText read(const std::string& path, std::size_t maxBytes);

    const std::string& name() const noexcept { return fName; }
    const std::string& text() const noexcept { return fText; }
    // Up to and with the last slash of the name; empty for the current directory.
    std::string directory() const;

    // Cheap for places asked for in the order of the text: lines are counted on from the last one.
    SourcePlace place(std::size_t offset) const;
    [[noreturn]] void fail(std::size_t offset, const std::string& cause) const;

  private:
    std::size_t lineOf(std::size_t offset) const;

    std::string fName;
    std::string fText;
    mutable std::size_t fCountedOffset = 0; // up to here there are
    mutable std::size_t fCountedBreaks = 0; // so many line ends
};

// Finds an included file: the first that exists in the including file's directory (with its slash, or empty), the
// current directory, and the include directories. An absolute name is taken as it is. Returns: its path; empty when
// there is none.
std::string findInclude(const std::string& name, const std::string& includingDirectory,
                        const std::vector<std::string>& includeDirectories);

} // namespace Pegasus::mof
