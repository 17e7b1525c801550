#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// A property that holds a value, on an instance or on a class, with its texts for a person.
class ICIMProperty
{
  public:
    virtual ~ICIMProperty() = default;

    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    virtual bool IsArray(TCIMContext context) const = 0;
    // Returns: true when the value is the declaration's default.
    virtual bool IsDefaultValue(TCIMContext context) const = 0;
    virtual TCIMValue GetValue(TCIMContext context) const = 0;
    virtual void SetValue(TCIMValue value, TCIMContext context) = 0;
    virtual bool GetPropagated(TCIMContext context) const = 0;
    // Returns: the declaration, null when there is none or it is gone.
    virtual boost::shared_ptr<ICIMPropertyDecl> GetDeclaration(TCIMContext context) const = 0;
    virtual bool operator==(const ICIMProperty& other) const = 0;
    virtual bool operator<(const ICIMProperty& other) const = 0;
    virtual ICIMProperty& operator=(const ICIMProperty& other) = 0;

    // The previous value, for a host that compares two inventories.
    virtual TCIMValue GetPrevValue() const = 0;
    virtual void SetPrevValue(TCIMValue value) = 0;
    virtual void SetPrevValue() = 0; // to the current value
    virtual bool IsPrevValueDifferent() const = 0;

    // Returns: the value for a person: the declaration's Values text for its ValueMap entry, else the plain text
    // with the declaration's unit; array elements joined by ", "; null the empty text.
    virtual std::string ToString() const = 0;
    virtual std::string PrevValueToString() const = 0;
    // Returns: one text per array element, one for a scalar, none for null.
    virtual std::vector<std::string> ToStringVector() const = 0;
};

} // namespace NKOLVRX20
