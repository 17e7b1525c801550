// SPDX-License-Identifier: MIT
#include "host/core/TCIMValueRep.h"

#include <host/TCIMValue.h>

#include <boost/make_shared.hpp>

namespace NKOLVRX20 {
namespace {

bool IsElementCode(TCIMValue::TCIMType type)
{
    return type >= TCIMValue::TCIMType::kBoolean && !type.IsArray();
}

} // namespace

TCIMValue::TCIMValue() = default;
TCIMValue::TCIMValue(bool value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(unsigned char value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(signed char value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(unsigned short value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(short value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(unsigned int value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(int value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(unsigned long value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(long value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(float value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(double value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(const std::string& value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(const char* value) : TCIMValue(std::string(value)) {}
TCIMValue::TCIMValue(const TCIMChar16& value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(const TCIMDateTime& value) : fRep(TRep::Of(value)) {}
TCIMValue::TCIMValue(const TCIMReference& value) : fRep(TRep::Of(value)) {}

TCIMValue::TCIMValue(TCIMType type, unsigned int)
{
    if (type > TCIMType::kReferenceArray) {
        ThrowTypeMismatch();
    }
    if (type == TCIMType::kNone) { // the null of unknown type has no representation
        return;
    }
    TRep::TData data;
    if (type.IsArray()) {
        data = std::vector<TCIMValue>();
    }
    fRep = boost::make_shared<TRep>(type.GetElementType(), std::move(data));
}

TCIMValue::TCIMValue(TCIMType elementType, unsigned int, const std::vector<TCIMValue>& elements)
{
    if (!IsElementCode(elementType)) {
        ThrowTypeMismatch();
    }
    for (const TCIMValue& element : elements) {
        if (element.IsArray() || element.GetType() != elementType) {
            ThrowTypeMismatch();
        }
    }
    fRep = TRep::Of(elements);
    fRep->fElementType = elementType;
}

TCIMValue::TCIMValue(const TCIMValue& other)
{
    *this = other;
}

TCIMValue::TCIMValue(TCIMValue&& other) noexcept = default;

TCIMValue& TCIMValue::operator=(const TCIMValue& other)
{
    if (this == &other) {
        return *this;
    }
    // Whoever holds the lent vector may still write it, so a copy gets a vector of its own.
    if (other.fRep && other.fRep->fLent) {
        fRep = boost::make_shared<TRep>(*other.fRep);
        fRep->fLent = false;
    } else {
        fRep = other.fRep;
    }
    return *this;
}

TCIMValue& TCIMValue::operator=(TCIMValue&& other) noexcept = default;

TCIMValue::~TCIMValue() = default;

TCIMValue::TCIMType TCIMValue::GetType() const
{
    return fRep ? fRep->fElementType : TCIMType();
}

bool TCIMValue::IsArray() const
{
    return fRep && fRep->IsArray();
}

bool TCIMValue::IsNull() const
{
    return !fRep || fRep->IsNull();
}

TCIMValue::operator const std::vector<TCIMValue>&() const
{
    if (!IsArray()) {
        ThrowTypeMismatch();
    }
    return std::get<std::vector<TCIMValue>>(fRep->fData);
}

TCIMValue::operator std::vector<TCIMValue>&()
{
    if (!IsArray()) {
        ThrowTypeMismatch();
    }
    // The caller may write the vector at any later time: from now on the representation belongs to this value alone.
    if (!fRep->fLent) {
        fRep = boost::make_shared<TRep>(*fRep);
        fRep->fLent = true;
    }
    return std::get<std::vector<TCIMValue>>(fRep->fData);
}

boost::shared_ptr<ICIMClass> TCIMValue::GetReferencedClass() const
{
    return fRep ? fRep->fReferencedClass.lock() : boost::shared_ptr<ICIMClass>();
}

void TCIMValue::SetReferencedClass(const boost::shared_ptr<ICIMClass>& referencedClass)
{
    auto rep = fRep ? boost::make_shared<TRep>(*fRep)
                    : boost::make_shared<TRep>(TCIMType(TCIMType::kReference), TRep::TData());
    rep->fReferencedClass = referencedClass;
    fRep = rep;
}

} // namespace NKOLVRX20
