// SPDX-License-Identifier: MIT
#include "pegasus/mof/SourceText.h"

#include "pegasus/base/Descriptor.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Pegasus::mof {

namespace {

// A diagnostic shows lines up to this length; in a longer one the caret is hard to find.
constexpr std::size_t kShownLineBytes = 240;

ssize_t readSome(int descriptor, char* buffer, std::size_t size)
{
    ssize_t count = -1;
    do {
        count = ::read(descriptor, buffer, size);
    } while (count < 0 && errno == EINTR);
    return count;
}

std::string readAll(int descriptor, const std::string& path, std::size_t maxBytes)
{
    std::string text;
    char buffer[65536];
    for (;;) {
        const ssize_t count = readSome(descriptor, buffer, sizeof buffer);
        if (count < 0) {
            throw FileError(FileError::Kind::kNotReadable, "Can't read file " + path + ": " + std::strerror(errno));
        }
        if (count == 0) {
            return text;
        }
        text.append(buffer, static_cast<std::size_t>(count));
        if (text.size() > maxBytes) {
            throw FileError(FileError::Kind::kNotReadable, "Can't read file " + path +
                                                               ": larger than the limit fileBytes (" +
                                                               std::to_string(maxBytes) + ")");
        }
    }
}

} // namespace

SourceText SourceText::read(const std::string& path, std::size_t maxBytes)
{
    const base::Descriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
    struct stat status = {};
    if (!file || ::fstat(file.get(), &status) != 0) {
        throw FileError(FileError::Kind::kNotOpened, "Can't open file " + path);
    }
    if (!S_ISREG(status.st_mode)) {
        throw FileError(FileError::Kind::kNotReadable,
                        "Can't read file " + path + ": it is " +
                            (S_ISDIR(status.st_mode) ? "a directory" : "a pipe or a device, not a regular file"));
    }
    return SourceText(path, readAll(file.get(), path, maxBytes));
}

bool SourceText::hasByteOrderMark() const noexcept
{
    return fText.compare(0, 3, "\xEF\xBB\xBF") == 0;
}

std::string SourceText::directory() const
{
    const std::size_t slash = fName.rfind('/');
    return slash == std::string::npos ? std::string() : fName.substr(0, slash + 1);
}

std::size_t SourceText::lineOf(std::size_t offset) const
{
    if (offset < fCountedOffset) {
        fCountedOffset = fCountedBreaks = 0;
    }
    const auto begin = fText.begin();
    const auto at = [&begin](std::size_t o) { return begin + static_cast<std::ptrdiff_t>(o); };
    fCountedBreaks += static_cast<std::size_t>(std::count(at(fCountedOffset), at(offset), '\n'));
    fCountedOffset = offset;
    return 1 + fCountedBreaks;
}

SourcePlace SourceText::place(std::size_t offset) const
{
    offset = std::min(offset, fText.size());
    const std::size_t lastBreak = offset == 0 ? std::string::npos : fText.rfind('\n', offset - 1);
    const std::size_t lineStart = lastBreak == std::string::npos ? 0 : lastBreak + 1;
    const std::size_t lineEnd = std::min(fText.find_first_of("\r\n", lineStart), fText.size());

    SourcePlace place;
    place.file = fName;
    place.line = lineOf(offset);
    place.column = 1 + offset - lineStart;
    if (fShowsLines && lineEnd - lineStart <= kShownLineBytes) {
        place.lineText = fText.substr(lineStart, lineEnd - lineStart);
    }
    return place;
}

void SourceText::fail(std::size_t offset, const std::string& cause) const
{
    throw MofError(place(offset), cause);
}

} // namespace Pegasus::mof
