// SPDX-License-Identifier: MIT
#include "pegasus/common/CivilTime.h"
#include "pegasus/common/RepPointerImpl.h"

#include <Pegasus/Common/CIMDateTime.h>

#include <algorithm>
#include <array>
#include <ctime>

namespace Pegasus {

// A default-constructed one is the default interval.
struct CIMDateTimeRep : RefCounted
{
    Uint64 fMicros = 0;     // of the interval, or of the local time since the beginning of year 0
    Sint32 fUtcMinutes = 0; // local time minus UTC
    Uint32 fWildcards = 0;  // how many of the 20 digits are `*`, from the right
    bool fIsInterval = true;
};

template class RepPointer<CIMDateTimeRep>;

namespace {

using Rep = CIMDateTimeRep;

constexpr Uint32 kTextSize = 25;
constexpr Uint32 kPointAt = 14;
constexpr Uint32 kSignAt = 21;
constexpr Uint32 kDigits = 20;
constexpr Uint32 kMicroDigits = 6;

// The 20 digits; the point is left out.
using Digits = std::array<char, kDigits>;

struct Field
{
    Uint32 at;
    Uint32 size;
};
constexpr Field kYear{0, 4}, kMonth{4, 2}, kDay{6, 2}, kDays{0, 8}, kHour{8, 2}, kMinute{10, 2}, kSecond{12, 2},
    kMicros{14, kMicroDigits};

bool isDigit(Uint16 unit)
{
    return unit >= '0' && unit <= '9';
}

Digits readDigits(const Char16* text)
{
    Digits digits{};
    for (Uint32 i = 0; i < kDigits; ++i) {
        const Uint16 unit = text[i < kPointAt ? i : i + 1];
        if (!isDigit(unit) && unit != '*') {
            throw InvalidDateTimeFormatException();
        }
        digits[i] = static_cast<char>(unit);
    }
    return digits;
}

// Wildcards stand at the end of the digits and, outside the microseconds, fill whole fields.
Uint32 countWildcards(const Digits& digits, bool isInterval)
{
    const auto first = static_cast<Uint32>(std::find(digits.begin(), digits.end(), '*') - digits.begin());
    if (std::any_of(digits.begin() + first, digits.end(), [](char digit) { return digit != '*'; })) {
        throw InvalidDateTimeFormatException();
    }
    const bool inYear = first > 0 && first < 4;
    const bool splitsField =
        first < kPointAt && (isInterval ? first != 0 && (first < 8 || first % 2 != 0) : inYear || first % 2 != 0);
    if (splitsField) {
        throw InvalidDateTimeFormatException();
    }
    return kDigits - first;
}

// A wildcard digit counts as 0, a field of wildcards only as `ifWild`.
Uint32 readField(const Digits& digits, const Field& field, Uint32 ifWild = 0)
{
    if (digits[field.at] == '*') {
        return ifWild;
    }
    Uint32 number = 0;
    for (Uint32 i = field.at; i < field.at + field.size; ++i) {
        number = number * 10 + (digits[i] == '*' ? 0 : static_cast<Uint32>(digits[i] - '0'));
    }
    return number;
}

Uint64 readTimeOfDay(const Digits& digits)
{
    const Uint32 hour = readField(digits, kHour);
    const Uint32 minute = readField(digits, kMinute);
    const Uint32 second = readField(digits, kSecond);
    if (hour > 23) {
        throw DateTimeOutOfRangeException("illegal hours number ");
    }
    if (minute > 59) {
        throw DateTimeOutOfRangeException("illegal minutes number ");
    }
    if (second > 59) {
        throw DateTimeOutOfRangeException("illegal seconds number ");
    }
    return hour * kMicrosPerHour + minute * kMicrosPerMinute + second * kMicrosPerSecond + readField(digits, kMicros);
}

Uint64 readDay(const Digits& digits, bool isInterval)
{
    if (isInterval) {
        return readField(digits, kDays, 1);
    }
    const CivilDay day{readField(digits, kYear), readField(digits, kMonth, 1), readField(digits, kDay, 1)};
    if (day.month < 1 || day.month > 12) {
        throw DateTimeOutOfRangeException("illegal month number");
    }
    if (day.day < 1 || day.day > daysInMonth(day.year, day.month)) {
        throw DateTimeOutOfRangeException("illegal day number");
    }
    return dayNumber(day);
}

Sint32 readOffset(const Char16* text)
{
    Sint32 minutes = 0;
    for (Uint32 i = kSignAt + 1; i < kTextSize; ++i) {
        if (!isDigit(text[i])) {
            throw InvalidDateTimeFormatException();
        }
        minutes = minutes * 10 + (Uint16(text[i]) - '0');
    }
    return text[kSignAt] == '-' ? -minutes : minutes;
}

void parse(const String& str, Rep& rep)
{
    const Char16* text = str.getChar16Data();
    if (str.size() != kTextSize || text[kPointAt] != '.') {
        throw InvalidDateTimeFormatException();
    }
    const Uint16 sign = text[kSignAt];
    if (sign != ':' && sign != '+' && sign != '-') {
        throw InvalidDateTimeFormatException();
    }
    rep.fIsInterval = sign == ':';
    rep.fUtcMinutes = readOffset(text);
    if (rep.fIsInterval && rep.fUtcMinutes != 0) {
        throw InvalidDateTimeFormatException();
    }
    const Digits digits = readDigits(text);
    rep.fWildcards = countWildcards(digits, rep.fIsInterval);
    rep.fMicros = readDay(digits, rep.fIsInterval) * kMicrosPerDay + readTimeOfDay(digits);
}

void writeField(char* digits, const Field& field, Uint64 number)
{
    for (Uint32 i = field.size; i > 0; --i, number /= 10) {
        digits[field.at + i - 1] = static_cast<char>('0' + number % 10);
    }
}

Digits writeDigits(const Rep& rep)
{
    Digits digits{};
    const Uint64 days = rep.fMicros / kMicrosPerDay;
    const Uint64 time = rep.fMicros % kMicrosPerDay;
    if (rep.fIsInterval) {
        writeField(digits.data(), kDays, days);
    } else {
        const CivilDay day = civilDay(static_cast<Uint32>(days));
        writeField(digits.data(), kYear, day.year);
        writeField(digits.data(), kMonth, day.month);
        writeField(digits.data(), kDay, day.day);
    }
    writeField(digits.data(), kHour, time / kMicrosPerHour);
    writeField(digits.data(), kMinute, time / kMicrosPerMinute % 60);
    writeField(digits.data(), kSecond, time / kMicrosPerSecond % 60);
    writeField(digits.data(), kMicros, time % kMicrosPerSecond);
    std::fill(digits.end() - rep.fWildcards, digits.end(), '*');
    return digits;
}

String format(const Rep& rep)
{
    char text[kTextSize];
    const Digits digits = writeDigits(rep);
    std::copy(digits.begin(), digits.begin() + kPointAt, text);
    text[kPointAt] = '.';
    std::copy(digits.begin() + kPointAt, digits.end(), text + kPointAt + 1);
    text[kSignAt] = rep.fIsInterval ? ':' : (rep.fUtcMinutes < 0 ? '-' : '+');
    writeField(text, Field{kSignAt + 1, 3}, static_cast<Uint64>(std::abs(rep.fUtcMinutes)));
    return String(text, kTextSize);
}

// Signed: a local time early in year 0 can be before it in UTC.
Sint64 utcMicros(const Rep& rep)
{
    return Sint64(rep.fMicros) - Sint64(rep.fUtcMinutes) * Sint64(kMicrosPerMinute);
}

RepPointer<Rep> make(Uint64 micros, bool isInterval, Sint32 utcMinutes = 0, Uint32 wildcards = 0)
{
    if (isInterval && micros >= kIntervalEnd) {
        throw DateTimeOutOfRangeException("Cannot create a CIMDateTime interval greater than 100 million days");
    }
    if (!isInterval && micros >= kTimeStampEnd) {
        throw DateTimeOutOfRangeException("Cannot create a CIMDateTime time stamp beyond the year 10,000");
    }
    RepPointer<Rep> rep(new Rep());
    rep->fMicros = micros;
    rep->fUtcMinutes = utcMinutes;
    rep->fWildcards = wildcards;
    rep->fIsInterval = isInterval;
    return rep;
}

const Rep& repOf(const RepPointer<Rep>& pointer)
{
    static const Rep kDefault;
    return pointer ? *pointer : kDefault;
}

Sint64 difference(const Rep& x, const Rep& y)
{
    if (x.fIsInterval != y.fIsInterval) {
        throw TypeMismatchException("Trying to compare CIMDateTime objects of differing types");
    }
    const Sint64 left = utcMicros(x);
    const Sint64 right = utcMicros(y);
    return left < right ? -1 : (left > right ? 1 : 0);
}

void expectInterval(const Rep& rep)
{
    if (!rep.fIsInterval) {
        throw TypeMismatchException("Only an interval can be used here");
    }
}

} // namespace

CIMDateTime::CIMDateTime(const String& str)
{
    set(str);
}

CIMDateTime::CIMDateTime(Uint64 microSec, Boolean isInterval) : fRep(make(microSec, isInterval)) {}

String CIMDateTime::toString() const
{
    return format(repOf(fRep));
}

void CIMDateTime::set(const String& str)
{
    RepPointer<Rep> rep(new Rep());
    parse(str, *rep);
    fRep = rep;
}

void CIMDateTime::clear()
{
    fRep = RepPointer<Rep>();
}

CIMDateTime CIMDateTime::getCurrentDateTime()
{
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    tm local{};
    ::localtime_r(&now.tv_sec, &local);
    const auto minutes = static_cast<Sint32>(local.tm_gmtoff / 60);
    const Sint64 micros = (Sint64(now.tv_sec) + Sint64(minutes) * 60) * Sint64(kMicrosPerSecond) + now.tv_nsec / 1000;
    CIMDateTime result;
    result.fRep = make(static_cast<Uint64>(micros) + kUnixEpochMicros, false, minutes);
    return result;
}

Sint64 CIMDateTime::getDifference(CIMDateTime startTime, CIMDateTime finishTime)
{
    if (startTime.isInterval() != finishTime.isInterval()) {
        throw InvalidDateTimeFormatException();
    }
    return utcMicros(repOf(finishTime.fRep)) - utcMicros(repOf(startTime.fRep));
}

Boolean CIMDateTime::isInterval() const
{
    return repOf(fRep).fIsInterval;
}

Boolean CIMDateTime::equal(const CIMDateTime& x) const
{
    return difference(repOf(fRep), repOf(x.fRep)) == 0;
}

Uint64 CIMDateTime::toMicroSeconds() const
{
    return static_cast<Uint64>(std::max<Sint64>(utcMicros(repOf(fRep)), 0));
}

CIMDateTime CIMDateTime::operator+(const CIMDateTime& cdt) const
{
    const Rep& left = repOf(fRep);
    const Rep& right = repOf(cdt.fRep);
    expectInterval(right);
    CIMDateTime sum;
    sum.fRep = make(left.fMicros + right.fMicros, left.fIsInterval, left.fUtcMinutes,
                    std::max(left.fWildcards, right.fWildcards));
    return sum;
}

CIMDateTime& CIMDateTime::operator+=(const CIMDateTime& cdt)
{
    return *this = *this + cdt;
}

CIMDateTime CIMDateTime::operator-(const CIMDateTime& cdt) const
{
    const Rep& left = repOf(fRep);
    const Rep& right = repOf(cdt.fRep);
    if (left.fIsInterval) {
        expectInterval(right);
    }
    const bool betweenStamps = !left.fIsInterval && !right.fIsInterval;
    const Sint64 micros =
        betweenStamps ? utcMicros(left) - utcMicros(right) : Sint64(left.fMicros) - Sint64(right.fMicros);
    if (micros < 0) {
        throw DateTimeOutOfRangeException("Result of subtracting two CIMDateTimes would be negative.");
    }
    CIMDateTime result;
    result.fRep = make(static_cast<Uint64>(micros), left.fIsInterval || betweenStamps,
                       betweenStamps ? 0 : left.fUtcMinutes, std::max(left.fWildcards, right.fWildcards));
    return result;
}

CIMDateTime& CIMDateTime::operator-=(const CIMDateTime& cdt)
{
    return *this = *this - cdt;
}

CIMDateTime CIMDateTime::operator*(Uint64 num) const
{
    const Rep& rep = repOf(fRep);
    expectInterval(rep);
    if (num != 0 && rep.fMicros > kIntervalEnd / num) {
        throw DateTimeOutOfRangeException("Cannot create a CIMDateTime interval greater than 100 million days");
    }
    CIMDateTime product;
    product.fRep = make(rep.fMicros * num, true, 0, rep.fWildcards);
    return product;
}

CIMDateTime& CIMDateTime::operator*=(Uint64 num)
{
    return *this = *this * num;
}

CIMDateTime CIMDateTime::operator/(Uint64 num) const
{
    const Rep& rep = repOf(fRep);
    expectInterval(rep);
    if (num == 0) {
        throw Exception("CIMDateTime: division by zero");
    }
    CIMDateTime quotient;
    quotient.fRep = make(rep.fMicros / num, true, 0, rep.fWildcards);
    return quotient;
}

CIMDateTime& CIMDateTime::operator/=(Uint64 num)
{
    return *this = *this / num;
}

Uint64 CIMDateTime::operator/(const CIMDateTime& cdt) const
{
    expectInterval(repOf(fRep));
    expectInterval(repOf(cdt.fRep));
    if (repOf(cdt.fRep).fMicros == 0) {
        throw Exception("CIMDateTime: division by zero");
    }
    return repOf(fRep).fMicros / repOf(cdt.fRep).fMicros;
}

Boolean CIMDateTime::operator<(const CIMDateTime& cdt) const
{
    return difference(repOf(fRep), repOf(cdt.fRep)) < 0;
}

Boolean CIMDateTime::operator<=(const CIMDateTime& cdt) const
{
    return difference(repOf(fRep), repOf(cdt.fRep)) <= 0;
}

Boolean CIMDateTime::operator>(const CIMDateTime& cdt) const
{
    return difference(repOf(fRep), repOf(cdt.fRep)) > 0;
}

Boolean CIMDateTime::operator>=(const CIMDateTime& cdt) const
{
    return difference(repOf(fRep), repOf(cdt.fRep)) >= 0;
}

Boolean CIMDateTime::operator!=(const CIMDateTime& cdt) const
{
    return difference(repOf(fRep), repOf(cdt.fRep)) != 0;
}

Boolean operator==(const CIMDateTime& x, const CIMDateTime& y)
{
    return x.equal(y);
}

} // namespace Pegasus
