// SPDX-License-Identifier: MIT
#pragma once

#include <host/TCIMValue.h>
#include <host/TVRXException.h>

#include <boost/weak_ptr.hpp>

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
    explicit TRep(TData data) : fElementType(TCIMType::ECIMType(data.index())), fData(std::move(data)) {}

    bool IsNull() const { return fData.index() == 0; }
    bool IsArray() const { return std::holds_alternative<std::vector<TCIMValue>>(fData); }

    TCIMType fElementType; // a scalar code, also of an array
    TData fData;
    boost::weak_ptr<ICIMClass> fReferencedClass;
    bool fLent = false;
};

} // namespace NKOLVRX20
