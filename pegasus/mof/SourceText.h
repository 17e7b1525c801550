#pragma once

#include "pegasus/mof/MofError.h"

#include <string>
#include <vector>

namespace Pegasus::mof {

// One source file in memory. Tokens keep byte offsets; place() makes a line and column of one when a person must read
// it.
class SourceText
{
  public:
    SourceText(std::string name, std::string text) : fName(std::move(name)), fText(std::move(text)) {}

    // Throws: FileError ("Can't open file <path>", "Can't read file …") also for a directory and a file beyond
    //     `maxBytes`.
    // Blocks: as long as the file does; a pipe, until its writer closes it.
    static SourceText read(const std::string& path, std::size_t maxBytes);

    const std::string& name() const noexcept { return fName; }
    const std::string& text() const noexcept { return fText; }
    // Returns: the name up to and including its last slash; empty for the current directory.
    std::string directory() const;

    // Fast for offsets in the order of the text: lines are counted from the last offset on. Warnings are in this order.
    SourcePlace place(std::size_t offset) const;
    [[noreturn]] void fail(std::size_t offset, const std::string& cause) const;

  private:
    std::size_t lineOf(std::size_t offset) const;

    std::string fName;
    std::string fText;
    mutable std::size_t fCountedOffset = 0; // of place()'s last call
    mutable std::size_t fCountedBreaks = 0; // line ends before fCountedOffset
};

// Finds an included file: the first that exists in the including file's directory (with its slash, or empty), the
// current directory, and the include directories. An absolute name is taken as it is. Returns: its path; empty when
// it is absent.
std::string findInclude(const std::string& name, const std::string& includingDirectory,
                        const std::vector<std::string>& includeDirectories);

} // namespace Pegasus::mof
