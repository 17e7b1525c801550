// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/ArrayImpl.h"
#include "pegasus/common/NameAccess.h"
#include "pegasus/common/PackedInstance.h"
#include "pegasus/common/RepPointerImpl.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <atomic>
#include <memory>
#include <type_traits>

namespace Pegasus {

// What the handle classes share. Copying a representation copies handles; the clone functions go deep.

struct CIMQualifierRep : RefCounted
{
    CIMName fName;
    CIMValue fValue;
    CIMFlavor fFlavor;
    bool fPropagated = false;
};

struct CIMQualifierDeclRep : RefCounted
{
    CIMName fName;
    CIMValue fValue;
    CIMScope fScope;
    CIMFlavor fFlavor;
    Uint32 fArraySize = 0;
};

struct CIMPropertyRep : RefCounted
{
    Uint32 fArraySize = 0;
    CIMName fName;
    CIMValue fValue;
    CIMName fReferenceClassName;
    CIMName fClassOrigin;
    Array<CIMQualifier> fQualifiers;
    bool fPropagated = false;
};

struct CIMParameterRep : RefCounted
{
    CIMType fType = CIMTYPE_BOOLEAN;
    CIMName fName;
    CIMName fReferenceClassName;
    Array<CIMQualifier> fQualifiers;
    Uint32 fArraySize = 0;
    bool fIsArray = false;
};

struct CIMMethodRep : RefCounted
{
    CIMType fType = CIMTYPE_BOOLEAN;
    CIMName fName;
    CIMName fClassOrigin;
    Array<CIMQualifier> fQualifiers;
    Array<CIMParameter> fParameters;
    bool fPropagated = false;
};

struct CIMParamValueRep : RefCounted
{
    String fName;
    CIMValue fValue;
    bool fIsTyped = true;
};

// The class name is the path's. While the instance is packed, everything else here is empty;
// CIMConstInstance::unpacked() fills it.
struct CIMInstanceRep : RefCounted
{
    CIMInstanceRep() = default;
    explicit CIMInstanceRep(std::unique_ptr<const PackedInstance> packed) : fPacked(packed.release()) {}
    // Requires: `other` is unpacked.
    CIMInstanceRep(const CIMInstanceRep& other)
        : RefCounted(other), fPath(other.fPath), fQualifiers(other.fQualifiers), fProperties(other.fProperties)
    {
    }
    ~CIMInstanceRep() { delete fPacked.load(std::memory_order_relaxed); }

    CIMObjectPath fPath;
    Array<CIMQualifier> fQualifiers;
    Array<CIMProperty> fProperties;
    std::atomic<const PackedInstance*> fPacked{nullptr}; // null once it is unpacked
};

// The class name is the path's.
struct CIMClassRep : RefCounted
{
    CIMObjectPath fPath;
    CIMName fSuperClassName;
    Array<CIMQualifier> fQualifiers;
    Array<CIMProperty> fProperties;
    Array<CIMMethod> fMethods;
};

// Sub-objects by name, in lists that hold handles. `what` names the kind in "already exists: property "p"".
struct ObjectAccess
{
    template <typename Handle> static auto& rep(const Handle& handle)
    {
        if constexpr (std::is_base_of_v<CIMConstInstance, Handle>) {
            return handle.unpacked();
        } else {
            return handle.fRep.checked();
        }
    }
    template <typename Handle, typename Rep> static Handle wrap(Rep* adopted)
    {
        Handle handle;
        handle.fRep = RepPointer<Rep>(adopted);
        return handle;
    }
    static const CIMClass& classIn(const CIMConstObject& object) { return object.fClass; }
    static const CIMInstance& instanceIn(const CIMConstObject& object) { return object.fInstance; }

    template <typename Item> static Uint32 find(const Array<Item>& items, const CIMName& name)
    {
        const Item* data = items.getData();
        for (Uint32 i = 0; i < items.size(); ++i) {
            if (sameName(rep(data[i]).fName, name)) {
                return i;
            }
        }
        return PEG_NOT_FOUND;
    }

    template <typename Item> static void add(Array<Item>& items, const Item& item, const char* what)
    {
        const CIMName& name = item.getName();
        if (find(items, name) != PEG_NOT_FOUND) {
            throw AlreadyExistsException(String(what) + " \"" + name.getString() + "\"");
        }
        items.append(item);
    }

    // The handle itself: a change through it is a change of the list's object.
    template <typename Item> static Item at(const Array<Item>& items, Uint32 index) { return items[index]; }

    template <typename Item> static Array<Item> clone(const Array<Item>& items)
    {
        Array<Item> copies;
        copies.reserveCapacity(items.size());
        for (Uint32 i = 0; i < items.size(); ++i) {
            copies.append(items[i].clone());
        }
        return copies;
    }

    template <typename Item> static bool identical(const Array<Item>& x, const Array<Item>& y)
    {
        if (x.size() != y.size()) {
            return false;
        }
        for (Uint32 i = 0; i < x.size(); ++i) {
            if (!x[i].identical(y[i])) {
                return false;
            }
        }
        return true;
    }

    // Returns: whether there is a qualifier of this name that is boolean and true.
    static bool isTrue(const Array<CIMQualifier>& qualifiers, const CIMName& name)
    {
        const Uint32 index = find(qualifiers, name);
        return index != PEG_NOT_FOUND && qualifiers[index].getValue() == CIMValue(true);
    }
};

} // namespace Pegasus
