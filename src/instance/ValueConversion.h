// SPDX-License-Identifier: MIT
// Values between the CIM client library and the host: the only place where the two meet.
//
// Failures leave these functions as exceptions, unlogged, with the output as it was: Pegasus::TypeMismatchException
// (the declared type differs from the value's) and TVRXException 14 (a host value that fails to convert).
#pragma once

#include <Pegasus/Client/CIMClient.h>
#include <host/TCIMValue.h>

#include <boost/shared_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

// Converts a server's value by its declared type. A char16 arrives as its code; the elements of a string array arrive
// as the client library's stream operator writes them; a reference arrives as its whole path text, bound to the
// namespace of the class. Objects, instances and arrays of references leave the output as it was.
// Requires: a non-null value; the class only for references.
void pegValToVRX(std::string name, Pegasus::CIMValue value, Pegasus::CIMType type, bool isArray, TCIMValue& out,
                 boost::shared_ptr<ICIMClass> forClass);

// The same without copies, for properties by the thousand. The class may be null unless the value is a reference.
void ToHostValue(const Pegasus::CIMValue& value, Pegasus::CIMType type, bool isArray, const ICIMClass* forClass,
                 TCIMValue& out);

// Converts a host's value for a method call. Elements of 16-bit integer arrays keep only their low byte and travel as
// 8-bit arrays. An untyped value and an array of references leave the output as it was.
void vrxValToPeg(const TCIMValue& in, Pegasus::CIMValue& out);

// Sets an array of TPeg from elements that are read as THost; the last two arguments only choose the types.
// Requires: an array.
template <typename THost, typename TPeg> void vrxArrayToPeg(const TCIMValue& in, Pegasus::CIMValue& out, THost, TPeg)
{
    Pegasus::Array<TPeg> elements;
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(in)) {
        elements.append(static_cast<TPeg>(static_cast<THost>(element)));
    }
    out.set(elements);
}

// Returns: the host's code; 0 for a scalar and 16 for an array of a type that the host lacks.
TCIMValue::TCIMType pegTypeToVRXType(Pegasus::CIMType type, bool isArray);

} // namespace NKOLVRX20
