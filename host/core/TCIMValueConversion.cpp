// SPDX-License-Identifier: MIT
// TCIMValue's conversion operators.
#include "host/core/TCIMValueRep.h"

#include <host/TCIMValue.h>

#include <cmath>
#include <limits>
#include <type_traits>

namespace NKOLVRX20 {
namespace {

// Converting a real outside the integer's range is undefined behaviour in C++; here it saturates, and NaN becomes 0.
template <typename To, typename From> To SaturatingCast(From value)
{
    if (std::isnan(value)) {
        return 0;
    }
    // The lowest value is a power of two or 0 and so exact in From; one above the highest is exact too.
    if (value <= static_cast<From>(std::numeric_limits<To>::lowest())) {
        return std::numeric_limits<To>::lowest();
    }
    if (value >= std::ldexp(From(1), std::numeric_limits<To>::digits)) {
        return std::numeric_limits<To>::max();
    }
    return static_cast<To>(value);
}

template <typename To, typename From> To ConvertNumber(From value)
{
    if constexpr (std::is_same_v<To, bool>) {
        return value != From(0);
    } else if constexpr (std::is_floating_point_v<From> && std::is_integral_v<To>) {
        return SaturatingCast<To>(value);
    } else {
        return static_cast<To>(value);
    }
}

struct TNumberReader
{
    template <typename To, typename From> static To Read(const From& value)
    {
        if constexpr (std::is_arithmetic_v<From>) {
            return ConvertNumber<To>(value);
        } else if constexpr (std::is_same_v<From, TCIMChar16>) {
            return ConvertNumber<To>(value.GetCode());
        } else {
            ThrowTypeMismatch();
        }
    }
};

template <typename To, typename Data> To ReadNumber(const Data& data)
{
    return std::visit([](const auto& value) { return TNumberReader::Read<To>(value); }, data);
}

template <typename To, typename Data> const To& ReadExact(const Data& data)
{
    const To* value = std::get_if<To>(&data);
    if (!value) {
        ThrowTypeMismatch();
    }
    return *value;
}

template <typename Rep> const auto& DataOf(const boost::shared_ptr<Rep>& rep)
{
    if (!rep) {
        ThrowTypeMismatch();
    }
    return rep->fData;
}

} // namespace

TCIMValue::operator bool() const
{
    return ReadNumber<bool>(DataOf(fRep));
}
TCIMValue::operator unsigned char() const
{
    return ReadNumber<unsigned char>(DataOf(fRep));
}
TCIMValue::operator signed char() const
{
    return ReadNumber<signed char>(DataOf(fRep));
}
TCIMValue::operator unsigned short() const
{
    return ReadNumber<unsigned short>(DataOf(fRep));
}
TCIMValue::operator short() const
{
    return ReadNumber<short>(DataOf(fRep));
}
TCIMValue::operator unsigned int() const
{
    return ReadNumber<unsigned int>(DataOf(fRep));
}
TCIMValue::operator int() const
{
    return ReadNumber<int>(DataOf(fRep));
}
TCIMValue::operator unsigned long() const
{
    return ReadNumber<unsigned long>(DataOf(fRep));
}
TCIMValue::operator long() const
{
    return ReadNumber<long>(DataOf(fRep));
}
TCIMValue::operator float() const
{
    return ReadNumber<float>(DataOf(fRep));
}
TCIMValue::operator double() const
{
    return ReadNumber<double>(DataOf(fRep));
}

TCIMValue::operator std::string() const
{
    return ReadExact<std::string>(DataOf(fRep));
}
TCIMValue::operator TCIMChar16() const
{
    return ReadExact<TCIMChar16>(DataOf(fRep));
}
TCIMValue::operator TCIMDateTime() const
{
    return ReadExact<TCIMDateTime>(DataOf(fRep));
}
TCIMValue::operator TCIMReference() const
{
    return ReadExact<TCIMReference>(DataOf(fRep));
}

} // namespace NKOLVRX20
