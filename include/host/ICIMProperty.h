// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// A property that holds a value, on an instance or on a class, and its texts for a person. The rules of HostFwd.h hold.
// It holds its declaration weakly: once that is gone, the value and its plain text remain.
class ICIMProperty
{
  public:
    virtual ~ICIMProperty() = default;

    // Returns: the scalar code, or the array code of an array: the value's own type, and for an untyped null the
    // declaration's.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    // Returns: whether GetType is an array code.
    virtual bool IsArray(TCIMContext context) const = 0;
    // Returns: true when there is a declaration and the value equals its default.
    virtual bool IsDefaultValue(TCIMContext context) const = 0;
    // Returns: the value, possibly null.
    virtual TCIMValue GetValue(TCIMContext context) const = 0;
    // Replaces the value by one of any type. In memory only.
    virtual void SetValue(TCIMValue value, TCIMContext context) = 0;
    // Returns: true when there is a declaration and it is inherited.
    virtual bool GetPropagated(TCIMContext context) const = 0;
    // Returns: the declaration; null for an undeclared property, and when the declaration is gone.
    virtual boost::shared_ptr<ICIMPropertyDecl> GetDeclaration(TCIMContext context) const = 0;
    // Comparisons are by value; the assignment takes over the value alone.
    virtual bool operator==(const ICIMProperty& other) const = 0;
    virtual bool operator<(const ICIMProperty& other) const = 0;
    virtual ICIMProperty& operator=(const ICIMProperty& other) = 0;

    // The previous value is the host's own: it compares two inventories with it. It starts null, and only the
    // host sets it.
    virtual TCIMValue GetPrevValue() const = 0;
    virtual void SetPrevValue(TCIMValue value) = 0;
    // Makes the current value the previous one.
    virtual void SetPrevValue() = 0;
    // Returns: whether the previous value differs from the current one; a null differs from every value.
    virtual bool IsPrevValueDifferent() const = 0;

    // Returns: the value for a person, by the first of the declaration's qualifiers that has a text for it: Values (the
    // entry of ValueMap), BitValues (the bits of BitMap), else the plain text with Units or PUnit. Array elements are
    // joined by ", "; null is the empty text.
    virtual std::string ToString() const = 0;
    // Returns: the same text of the previous value.
    virtual std::string PrevValueToString() const = 0;
    // Returns: one text an array element, one for a scalar, an empty vector for null.
    virtual std::vector<std::string> ToStringVector() const = 0;
};

} // namespace NKOLVRX20
