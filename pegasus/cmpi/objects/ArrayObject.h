// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ValueCodec.h"

#include <memory>
#include <vector>

namespace Pegasus::cmpi {

// A CMPIArray. Its size is fixed; its elements are null until they are set.
class ArrayObject final : public Owned, public CMPIArray
{
  public:
    // `type` may have the array bit, and be one that CIM lacks: no value fits then.
    // Throws: CMPI_RC_ERR_INVALID_PARAMETER for more elements than kMaxElements.
    ArrayObject(Broker& broker, CMPICount size, CMPIType type);
    ArrayObject(Broker& broker, CMPIType type, std::vector<CIMValue> elements);
    ArrayObject(const ArrayObject& other) : ArrayObject(other.fBroker, other.fType, other.fElements) {}
    ~ArrayObject() override;

    CMPIType elementType() const { return static_cast<CMPIType>(fType & ~CMPI_ARRAY); }
    // As the provider named it, which may be with the array bit; OpenPegasus shows it like that.
    CMPIType namedType() const { return fType; }
    const std::vector<CIMValue>& elements() const { return fElements; }

    // Throws: CMPI_RC_ERR_NO_SUCH_PROPERTY beyond the size.
    CMPIData at(CMPICount index) const;
    // Throws: also CMPI_RC_ERR_TYPE_MISMATCH.
    void set(CMPICount index, const CMPIValue* value, CMPIType type);
    // The array's elements have been copied: what it was filled with may be released.
    void markUsed() const;

    Lifetime lifetime = Lifetime::kFrame;

  private:
    void requireIndex(CMPICount index) const;
    void keepHandle(const CMPIValue& value, CMPIType type);

    Broker& fBroker;
    CMPIType fType; // as the provider named it
    std::vector<CIMValue> fElements;
    std::shared_ptr<bool> fUnused; // shared with the strings and datetimes that it was given
};

extern const CMPIArrayFT kArrayTable;

// A CIM array is one value; a CMPI array is filled and read element by element.

// Builds the array of `type` from its elements; a null one becomes the type's zero.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE for a type that has no arrays.
CIMValue arrayOf(CIMType type, const std::vector<CIMValue>& elements);

// Returns: the elements of an array value; an empty vector for a null.
// Throws: CMPI_RC_ERR_INVALID_DATA_TYPE.
std::vector<CIMValue> elementsOf(const CIMValue& array);

} // namespace Pegasus::cmpi
