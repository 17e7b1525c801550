// SPDX-License-Identifier: MIT
#pragma once

#include <host/TCIMValue.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

#include <utility>
#include <variant>

namespace NKOLVRX20 {

[[noreturn]] inline void ThrowTypeMismatch()
{
    throw TVRXException(TVRXStatusCode::kTypeMismatch);
}

// The shared, immutable representation of TCIMValues: a value that is written gets a new one.
// The exception is a lent representation, whose element vector was handed out for writing: it belongs to one value, and
// copies of that value copy it.
struct TCIMValue::TRep
{
    // The alternatives' indices are the scalar type codes; index 0 is null, the last one an array.
    using TData = std::variant<std::monostate, bool, unsigned char, signed char, unsigned short, short, unsigned int,
                               int, unsigned long, long, float, double, TCIMChar16, std::string, TCIMDateTime,
                               TCIMReference, std::vector<TCIMValue>>;

    TRep(TCIMType elementType, TData data) : fElementType(elementType), fData(std::move(data)) {}
    // A scalar's. An array's maker sets the type of its elements.
    template <typename T> TRep(std::in_place_type_t<T> alternative, T held) : fData(alternative, std::move(held))
    {
        fElementType = TCIMType::ECIMType(fData.index());
    }
    template <typename T> static boost::shared_ptr<TRep> Of(T held)
    {
        return boost::make_shared<TRep>(std::in_place_type<T>, std::move(held));
    }

    bool IsNull() const { return fData.index() == 0; }
    bool IsArray() const { return std::holds_alternative<std::vector<TCIMValue>>(fData); }

    TCIMType fElementType; // a scalar code, also of an array
    TData fData;
    boost::weak_ptr<ICIMClass> fReferencedClass;
    bool fLent = false;
};

} // namespace NKOLVRX20
