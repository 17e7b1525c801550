// SPDX-License-Identifier: MIT
#include "host/cli/record/TRecordReader.h"

#include "host/cli/record/TRecordParser.h"

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>

namespace vrxhost {
namespace {

constexpr char kSumWord[] = "sum\t";
constexpr char kEndWord[] = "end\t";
constexpr std::size_t kBlockBytes = 64u << 10;

// Hands out lines without their line feed, and knows how many there were and what they add up to.
class TLines
{
  public:
    TLines(std::istream& file, std::string name) : fFile(file), fName(std::move(name)) {}

    // Returns: false at the end of the file.
    bool Next(std::string& line)
    {
        line.clear();
        for (;;) {
            const std::size_t end = fBlock.find('\n', fAt);
            line.append(fBlock, fAt, end == std::string::npos ? end : end - fAt);
            if (line.size() > kMaxRecordLineBytes) {
                Refuse("the line is longer than " + std::to_string(kMaxRecordLineBytes >> 20) + " MiB", fNumber + 1);
            }
            if (end != std::string::npos) {
                fAt = end + 1;
                ++fNumber;
                return true;
            }
            if (!ReadBlock()) {
                fIsCut |= !line.empty();
                return false;
            }
        }
    }

    bool IsCut() const { return fIsCut; }
    std::size_t GetNumber() const { return fNumber; }

    [[noreturn]] void Refuse(const std::string& reason) const { Refuse(reason, fNumber); }

  private:
    [[noreturn]] void Refuse(const std::string& reason, std::size_t number) const
    {
        throw TRecordError(fName + ":" + std::to_string(number) + ": " + reason);
    }

    bool ReadBlock()
    {
        fBlock.resize(kBlockBytes);
        fAt = 0;
        fFile.read(fBlock.data(), static_cast<std::streamsize>(fBlock.size()));
        fBlock.resize(static_cast<std::size_t>(fFile.gcount()));
        fBytes += fBlock.size();
        if (fBytes > kMaxRecordBytes) {
            throw TRecordError(fName + " is larger than " + std::to_string(kMaxRecordBytes >> 20) + " MiB");
        }
        return !fBlock.empty();
    }

    std::istream& fFile;
    const std::string fName;
    std::string fBlock;
    std::size_t fAt = 0;
    std::size_t fNumber = 0;
    std::size_t fBytes = 0;
    bool fIsCut = false; // within a line
};

// Compares the sums in a record with those of its bytes.
class TSumCheck
{
  public:
    // Returns: whether the line is the record's own and not a sum.
    bool Add(const std::string& line, const TLines& lines)
    {
        const bool isSum = line.compare(0, sizeof kSumWord - 1, kSumWord) == 0;
        if (isSum) {
            Compare(line.substr(sizeof kSumWord - 1), lines);
        } else if (line.compare(0, sizeof kEndWord - 1, kEndWord) == 0) {
            const std::size_t sum = line.rfind('\t') + 1;
            fSum.Add(line.substr(0, sum));
            Compare(line.substr(sum), lines);
            return true;
        }
        fSum.Add(line);
        fSum.Add("\n");
        return !isSum;
    }

  private:
    void Compare(const std::string& sum, const TLines& lines)
    {
        if (sum != fSum.GetText()) {
            lines.Refuse("the record is damaged between the lines " + std::to_string(fGoodLines + 1) + " and " +
                         std::to_string(lines.GetNumber()) + ": their sum differs");
        }
        fGoodLines = lines.GetNumber();
    }

    TRecordSum fSum;
    std::size_t fGoodLines = 0;
};

} // namespace

TRecord ReadRecord(std::istream& file, const std::string& name)
{
    TLines lines(file, name);
    TSumCheck sums;
    TRecordParser parser;
    for (std::string line; lines.Next(line);) {
        if (!sums.Add(line, lines)) {
            continue;
        }
        try {
            parser.Add(line);
        } catch (const TRecordError&) {
            throw;
        } catch (const std::runtime_error& e) {
            lines.Refuse(e.what());
        }
    }
    if (lines.GetNumber() == 0) {
        throw TRecordError(name + " is not a record of vrxhost");
    }
    if (!parser.IsEnded() || lines.IsCut()) {
        lines.Refuse("the record is cut: it ends after this line");
    }
    return parser.Take();
}

TRecord ReadRecordFile(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    std::error_code ignored;
    if (!file || std::filesystem::is_directory(path, ignored)) {
        throw TRecordError("the record " + path + " could not be opened: " + std::strerror(file ? EISDIR : errno));
    }
    return ReadRecord(file, path);
}

} // namespace vrxhost
