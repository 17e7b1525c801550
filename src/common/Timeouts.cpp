#include "src/common/Timeouts.h"

#include <algorithm>
#include <cstdlib>
#include <limits>

namespace NKOLVRX20 {

namespace {

constexpr int kDecimal = 10; // the radix of strtol
constexpr unsigned long kMsPerSecond = 1000;
constexpr unsigned long kLongestSeconds = std::numeric_limits<unsigned int>::max() / kMsPerSecond;

// Whatever the host's locale counts as a digit.
bool IsDigit(char character)
{
    return character >= '0' && character <= '9';
}

} // namespace

unsigned int MillisecondsFromText(const std::string& seconds)
{
    const auto number = static_cast<unsigned long>(std::strtol(seconds.c_str(), nullptr, kDecimal));
    return static_cast<unsigned int>(number * kMsPerSecond);
}

// A number of digits alone that is too long for strtol becomes its largest result, which is too large here.
bool IsPlainTimeout(const std::string& seconds)
{
    return !seconds.empty() && std::all_of(seconds.begin(), seconds.end(), IsDigit) &&
           static_cast<unsigned long>(std::strtol(seconds.c_str(), nullptr, kDecimal)) <= kLongestSeconds;
}

} // namespace NKOLVRX20
