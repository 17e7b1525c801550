// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/MofError.h"

#include <string>

namespace Pegasus::mof {

// One source file in memory. Tokens keep byte offsets; place() makes a line and column of one when a person must read
// it.
class SourceText
{
  public:
    SourceText(std::string name, std::string text) : fName(std::move(name)), fText(std::move(text)) {}

    // Throws: FileError ("Can't open file <path>", "Can't read file …") also for a file beyond `maxBytes` and for what
    //     is not a regular file. A pipe or device is refused at once.
    static SourceText read(const std::string& path, std::size_t maxBytes);

    const std::string& name() const noexcept { return fName; }
    const std::string& text() const noexcept { return fText; }
    bool hasByteOrderMark() const noexcept;
    // Diagnostics show the place alone, without the line: the reader of a diagnostic may be somebody who may not read
    // the file.
    void hideLines() noexcept { fShowsLines = false; }
    // Returns: the name up to and including its last slash; empty for the current directory.
    std::string directory() const;

    // Fast for offsets in the order of the text: lines are counted from the last offset on. Warnings are in this order.
    SourcePlace place(std::size_t offset) const;
    [[noreturn]] void fail(std::size_t offset, const std::string& cause) const;

  private:
    std::size_t lineOf(std::size_t offset) const;

    std::string fName;
    std::string fText;
    bool fShowsLines = true;
    mutable std::size_t fCountedOffset = 0; // of place()'s last call
    mutable std::size_t fCountedBreaks = 0; // line ends before fCountedOffset
};

} // namespace Pegasus::mof
