// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/Exception.h>

// What a program does with the instances of an answer: it reads every value of each of them once. By the public
// interface alone.
namespace bench {

template <typename T> void readAs(const Pegasus::CIMConstProperty& property)
{
    if (property.isArray()) {
        Pegasus::Array<T> elements;
        property.getValue().get(elements);
    } else {
        T element{};
        property.getValue().get(element);
    }
}

// Throws: TypeMismatchException for a type that the benchmarks' instances lack.
inline void readValue(const Pegasus::CIMConstProperty& property)
{
    using namespace Pegasus;
    switch (property.getType()) {
    case CIMTYPE_BOOLEAN:
        return readAs<Boolean>(property);
    case CIMTYPE_UINT8:
        return readAs<Uint8>(property);
    case CIMTYPE_UINT16:
        return readAs<Uint16>(property);
    case CIMTYPE_UINT32:
        return readAs<Uint32>(property);
    case CIMTYPE_UINT64:
        return readAs<Uint64>(property);
    case CIMTYPE_SINT32:
        return readAs<Sint32>(property);
    case CIMTYPE_SINT64:
        return readAs<Sint64>(property);
    case CIMTYPE_REAL32:
        return readAs<Real32>(property);
    case CIMTYPE_REAL64:
        return readAs<Real64>(property);
    case CIMTYPE_DATETIME:
        return readAs<CIMDateTime>(property);
    case CIMTYPE_STRING:
        return readAs<String>(property);
    default:
        throw TypeMismatchException();
    }
}

// Returns: the number of the instances.
inline Pegasus::Uint32 readValues(const Pegasus::Array<Pegasus::CIMInstance>& instances)
{
    for (Pegasus::Uint32 i = 0; i < instances.size(); ++i) {
        const Pegasus::CIMConstInstance instance = instances[i];
        for (Pegasus::Uint32 j = 0; j < instance.getPropertyCount(); ++j) {
            readValue(instance.getProperty(j));
        }
    }
    return instances.size();
}

} // namespace bench
