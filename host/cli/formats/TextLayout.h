// SPDX-License-Identifier: MIT
// Pieces of text for a terminal.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace vrxhost {

// Returns: the columns that UTF-8 text takes, one for each character.
std::size_t ColumnCount(const std::string& text);

// Returns: the text with blanks up to the width.
std::string Padded(const std::string& text, std::size_t width);

// Returns: the text in lines of at most the width, broken at blanks where there are any.
std::vector<std::string> Folded(const std::string& text, std::size_t width);

// Returns: "1 class", "2 classes".
std::string Counted(std::size_t count, const char* noun);

// Rows of labelled text: "indent label  text", folded below the text's first column.
struct TLabelled
{
    std::string fLabel;
    std::string fText;
};
std::string LabelledLines(const std::vector<TLabelled>& rows, const std::string& indent, std::size_t width);

// A table of rows below headings; columns that the width has no room for go into further blocks, each of which begins
// with the first column again.
std::string TableBlocks(const std::vector<std::string>& headings, const std::vector<std::vector<std::string>>& rows,
                        const std::string& indent, std::size_t width);

} // namespace vrxhost
