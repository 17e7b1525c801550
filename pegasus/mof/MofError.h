// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

namespace Pegasus::mof {

// Text of a foreign file or of a server, for a terminal or a log: control characters and bytes outside UTF-8 become
// "\x1B", and the text stays on one line. Tabs and backslashes stay. Text that was converted before is unchanged.
std::string shownText(std::string_view text);

// A place in a source text. Lines and columns count from 1, columns in bytes.
struct SourcePlace
{
    std::string file;
    std::size_t line = 1;
    std::size_t column = 1;
    std::string lineText; // the whole line, for the caret; empty when it is not to be shown

    // Returns: "file:line:column", for a terminal.
    std::string text() const;
};

// What stopped a compilation, and where.
class MofError : public std::runtime_error
{
  public:
    MofError(SourcePlace place, const std::string& cause);

    const SourcePlace& place() const noexcept { return fPlace; }
    const std::string& cause() const noexcept { return fCause; }

    // Adds definitions of a file that follow the error and were skipped because of it.
    void addSkipped(std::size_t definitionCount) noexcept { fSkippedCount += definitionCount; }

    // Returns: "file:line:column: error: cause", the line, a caret below the column, and how many definitions were
    //     skipped, if any; ends with a newline.
    std::string diagnostic() const;

  private:
    SourcePlace fPlace;
    std::string fCause;
    std::size_t fSkippedCount = 0;
};

// A source file failed to open or to be read.
class FileError : public std::runtime_error
{
  public:
    enum class Kind
    {
        kNotOpened,
        kNotReadable // not a regular file, too large, a disk that fails
    };

    FileError(Kind kind, const std::string& text);

    Kind kind() const noexcept { return fKind; }

  private:
    Kind fKind;
};

} // namespace Pegasus::mof
