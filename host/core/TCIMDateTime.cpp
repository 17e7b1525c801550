// SPDX-License-Identifier: MIT
#include <host/TCIMDateTime.h>
#include <host/TVRXException.h>

#include <cstdio>
#include <cstring>

namespace NKOLVRX20 {
namespace {

// Positions inside the 25 characters (DSP0004, 5.2.4).
constexpr std::size_t kLength = 25;
constexpr std::size_t kPointAt = 14;
constexpr std::size_t kSignAt = 21;
constexpr std::size_t kSuffixAt = 22;

struct TField
{
    std::size_t fAt;
    std::size_t fLength;
};
constexpr TField kTimestampFields[] = {{0, 4}, {4, 2}, {6, 2}, {8, 2}, {10, 2}, {12, 2}};
constexpr TField kIntervalFields[] = {{0, 8}, {8, 2}, {10, 2}, {12, 2}};
constexpr TField kMicroseconds = {15, 6};

bool IsDigit(char c)
{
    return c >= '0' && c <= '9';
}

// An insignificant field consists of asterisks.
bool IsField(const std::string& text, TField field)
{
    const bool unspecified = text[field.fAt] == '*';
    for (std::size_t i = 0; i < field.fLength; ++i) {
        const char c = text[field.fAt + i];
        if (unspecified ? c != '*' : !IsDigit(c)) {
            return false;
        }
    }
    return true;
}

// Only microseconds lose significance digit by digit, from the right.
bool IsMicroseconds(const std::string& text)
{
    std::size_t i = kMicroseconds.fAt;
    const std::size_t end = i + kMicroseconds.fLength;
    while (i < end && IsDigit(text[i])) {
        ++i;
    }
    while (i < end && text[i] == '*') {
        ++i;
    }
    return i == end;
}

template <std::size_t N> bool AreFields(const std::string& text, const TField (&fields)[N])
{
    for (const TField& field : fields) {
        if (!IsField(text, field)) {
            return false;
        }
    }
    return true;
}

bool HasShape(const std::string& text)
{
    if (text.size() != kLength || text[kPointAt] != '.' || !IsMicroseconds(text)) {
        return false;
    }
    if (text[kSignAt] == ':') {
        return text.compare(kSuffixAt, 3, "000") == 0 && AreFields(text, kIntervalFields);
    }
    return (text[kSignAt] == '+' || text[kSignAt] == '-') && IsField(text, {kSuffixAt, 3}) &&
           AreFields(text, kTimestampFields);
}

std::string ClockText(const std::string& text)
{
    return text.substr(8, 2) + ":" + text.substr(10, 2) + ":" + text.substr(12, 2);
}

std::string IntervalText(const std::string& text)
{
    const std::string days = text.substr(0, 8);
    const std::size_t significant = days.find_first_not_of('0');
    if (significant == std::string::npos) {
        return ClockText(text);
    }
    const std::string count = days.substr(significant);
    return count + (count == "1" ? " day " : " days ") + ClockText(text);
}

// "+060" is minutes; a person reads hours and minutes.
std::string ZoneText(const std::string& text)
{
    if (text[kSuffixAt] == '*') {
        return "";
    }
    const int minutes = std::stoi(text.substr(kSuffixAt, 3));
    char zone[16];
    std::snprintf(zone, sizeof zone, " %c%02d:%02d", text[kSignAt], minutes / 60, minutes % 60);
    return zone;
}

} // namespace

TCIMDateTime::TCIMDateTime() : fText("00000000000000.000000:000") {}

TCIMDateTime::TCIMDateTime(const std::string& text) : fText(text)
{
    if (!HasShape(text)) {
        throw TVRXException(TVRXStatusCode::kTypeMismatch);
    }
}

void TCIMDateTime::Set(unsigned int days, unsigned short hours, unsigned short minutes, unsigned short seconds,
                       unsigned int microseconds)
{
    if (days > 99999999 || hours > 23 || minutes > 59 || seconds > 59 || microseconds > 999999) {
        throw TVRXException(TVRXStatusCode::kTypeMismatch);
    }
    char text[64];
    std::snprintf(text, sizeof text, "%08u%02u%02u%02u.%06u:000", days, unsigned(hours), unsigned(minutes),
                  unsigned(seconds), microseconds);
    fText = text;
}

bool TCIMDateTime::IsInterval() const
{
    return fText[kSignAt] == ':';
}

std::string TCIMDateTime::ToUIString() const
{
    if (IsInterval()) {
        return IntervalText(fText);
    }
    return fText.substr(0, 4) + "-" + fText.substr(4, 2) + "-" + fText.substr(6, 2) + " " + ClockText(fText) +
           ZoneText(fText);
}

} // namespace NKOLVRX20
