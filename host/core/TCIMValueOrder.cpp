// SPDX-License-Identifier: MIT
// TCIMValue's equality and order, from one comparison, so that they always agree.
#include "host/core/TCIMValueRep.h"

#include <host/TCIMValue.h>

#include <algorithm>
#include <cmath>
#include <type_traits>

namespace NKOLVRX20 {
namespace {

template <typename Value> int Compare(const Value& left, const Value& right)
{
    if constexpr (std::is_floating_point_v<Value>) {
        // NaN is equal to itself and less than every number, so that sorting stays defined.
        const bool leftNan = std::isnan(left), rightNan = std::isnan(right);
        if (leftNan || rightNan) {
            return int(rightNan) - int(leftNan);
        }
    }
    return left < right ? -1 : right < left ? 1 : 0;
}

// The type as one code, arrays after all scalars.
int TypeCode(const TCIMValue& value)
{
    return int(value.GetType()) + (value.IsArray() ? int(TCIMValue::TCIMType::kArrayOffset) : 0);
}

} // namespace

bool TCIMValue::operator==(const TCIMValue& other) const
{
    if (fRep == other.fRep) {
        return true;
    }
    return !(*this < other) && !(other < *this);
}

bool TCIMValue::operator<(const TCIMValue& other) const
{
    const int type = TypeCode(*this), otherType = TypeCode(other);
    if (type != otherType) {
        return type < otherType;
    }
    if (IsNull() || other.IsNull()) {
        return IsNull() && !other.IsNull();
    }
    return std::visit(
        [&other](const auto& value) {
            using TAlternative = std::decay_t<decltype(value)>;
            const auto& otherValue = std::get<TAlternative>(other.fRep->fData);
            if constexpr (std::is_same_v<TAlternative, std::monostate>) {
                return false;
            } else {
                return Compare(value, otherValue) < 0;
            }
        },
        fRep->fData);
}

} // namespace NKOLVRX20
