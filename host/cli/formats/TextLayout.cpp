// SPDX-License-Identifier: MIT
#include "host/cli/formats/TextLayout.h"

#include <algorithm>

namespace vrxhost {
namespace {

constexpr std::size_t kMinTextWidth = 20; // narrower terminals fold by themselves
constexpr std::size_t kCellWidth = 30;
constexpr char kGap[] = "  ";
constexpr std::size_t kGapWidth = 2;

bool ContinuesCharacter(char c)
{
    return (static_cast<unsigned char>(c) & 0xc0) == 0x80;
}

// Returns: the bytes of the longest beginning that takes at most this many columns.
std::size_t BytesOf(const std::string& text, std::size_t columns)
{
    std::size_t bytes = 0;
    for (std::size_t seen = 0; bytes < text.size(); ++bytes) {
        if (!ContinuesCharacter(text[bytes]) && ++seen > columns) {
            break;
        }
    }
    return bytes;
}

std::string WithoutTrailingBlanks(const std::string& line)
{
    return line.substr(0, line.find_last_not_of(' ') + 1);
}

struct TColumn
{
    std::string fHeading;
    std::vector<std::string> fCells;
    std::size_t fWidth = 0;
};

std::vector<TColumn> MakeColumns(const std::vector<std::string>& headings,
                                 const std::vector<std::vector<std::string>>& rows)
{
    std::vector<TColumn> columns;
    for (std::size_t i = 0; i < headings.size(); ++i) {
        TColumn column{headings[i], {}, ColumnCount(headings[i])};
        for (const auto& row : rows) {
            column.fCells.push_back(row[i]);
            column.fWidth = std::max(column.fWidth, std::min(ColumnCount(row[i]), kCellWidth));
        }
        columns.push_back(std::move(column));
    }
    return columns;
}

// A row is as high as its highest cell.
std::string RowLines(const std::vector<const TColumn*>& columns, const std::vector<std::string>& cells,
                     const std::string& indent)
{
    std::vector<std::vector<std::string>> folded;
    std::size_t height = 1;
    for (std::size_t i = 0; i < columns.size(); ++i) {
        folded.push_back(Folded(cells[i], columns[i]->fWidth));
        height = std::max(height, folded.back().size());
    }
    std::string lines;
    for (std::size_t at = 0; at < height; ++at) {
        std::string line = indent;
        for (std::size_t i = 0; i < columns.size(); ++i) {
            line += (i == 0 ? "" : kGap) + Padded(at < folded[i].size() ? folded[i][at] : "", columns[i]->fWidth);
        }
        lines += WithoutTrailingBlanks(line) + "\n";
    }
    return lines;
}

std::string Block(const std::vector<const TColumn*>& columns, const std::string& indent)
{
    std::vector<std::string> cells;
    for (const TColumn* column : columns) {
        cells.push_back(column->fHeading);
    }
    std::string lines = RowLines(columns, cells, indent);
    for (std::size_t row = 0; row < columns.front()->fCells.size(); ++row) {
        for (std::size_t i = 0; i < columns.size(); ++i) {
            cells[i] = columns[i]->fCells[row];
        }
        lines += RowLines(columns, cells, indent);
    }
    return lines;
}

} // namespace

std::size_t ColumnCount(const std::string& text)
{
    return text.size() - static_cast<std::size_t>(std::count_if(text.begin(), text.end(), ContinuesCharacter));
}

std::string Padded(const std::string& text, std::size_t width)
{
    const std::size_t columns = ColumnCount(text);
    return text + std::string(width > columns ? width - columns : 0, ' ');
}

std::vector<std::string> Folded(const std::string& text, std::size_t width)
{
    std::vector<std::string> lines;
    std::string rest = text;
    while (ColumnCount(rest) > width) {
        const std::size_t limit = BytesOf(rest, width);
        const std::size_t blank = rest.rfind(' ', limit);
        const bool atBlank = blank != std::string::npos && blank > 0;
        lines.push_back(WithoutTrailingBlanks(rest.substr(0, atBlank ? blank : limit)));
        rest.erase(0, atBlank ? blank + 1 : limit);
    }
    lines.push_back(rest);
    return lines;
}

std::string Counted(std::size_t count, const char* noun)
{
    const std::string suffix = count == 1 ? "" : *(noun + std::char_traits<char>::length(noun) - 1) == 's' ? "es" : "s";
    return std::to_string(count) + " " + noun + suffix;
}

std::string LabelledLines(const std::vector<TLabelled>& rows, const std::string& indent, std::size_t width)
{
    std::size_t labelWidth = 0;
    for (const TLabelled& row : rows) {
        labelWidth = std::max(labelWidth, ColumnCount(row.fLabel));
    }
    const std::size_t before = indent.size() + labelWidth + kGapWidth;
    std::string lines;
    for (const TLabelled& row : rows) {
        std::string label = row.fLabel;
        for (const std::string& part : Folded(row.fText, std::max(kMinTextWidth, width - std::min(width, before)))) {
            lines += WithoutTrailingBlanks(indent + Padded(label, labelWidth) + kGap + part) + "\n";
            label.clear();
        }
    }
    return lines;
}

std::string TableBlocks(const std::vector<std::string>& headings, const std::vector<std::vector<std::string>>& rows,
                        const std::string& indent, std::size_t width)
{
    const std::vector<TColumn> columns = MakeColumns(headings, rows);
    std::string text;
    for (std::size_t next = columns.empty() ? 0 : 1; !columns.empty();) {
        std::vector<const TColumn*> block = {&columns.front()};
        std::size_t used = indent.size() + columns.front().fWidth;
        while (next < columns.size() && (block.size() == 1 || used + kGapWidth + columns[next].fWidth <= width)) {
            used += kGapWidth + columns[next].fWidth;
            block.push_back(&columns[next++]);
        }
        text += (text.empty() ? "" : "\n") + Block(block, indent);
        if (next == columns.size()) {
            break;
        }
    }
    return text;
}

} // namespace vrxhost
