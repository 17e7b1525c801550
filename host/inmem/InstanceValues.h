// SPDX-License-Identifier: MIT
#pragma once

#include "host/inmem/InstanceLayout.h"
#include "host/inmem/TInmemProperty.h"

namespace NKOLVRX20 {

// The properties of one instance, by place in the layout of its class. Those that the layout had before the instance
// lie in one block, which lives as long as somebody holds one of them.
// Thread: one at a time.
class TInmemValues
{
  public:
    // The class may be null. It must outlive these values.
    explicit TInmemValues(const ICIMClass* instanceClass);

    // Returns: null when the value is unset.
    boost::shared_ptr<ICIMProperty> Find(const std::string& name) const;
    // In byte order of the normalised names, until the visitor returns false. The visitor may set values, and may
    // destroy this object.
    void Visit(const TPropertyVisitor& visitor) const;
    // Sets one of the class's instances; the context is for the class.
    // Throws: what the class's GetPropertyDecl throws, but for TVRXException 15.
    void Set(const std::string& name, TCIMValue&& value, const boost::shared_ptr<ICIMClass>& instanceClass,
             const TCIMContext& context);

  private:
    using TBlock = std::vector<TInmemProperty>;

    // Returns: null when the value is unset.
    TInmemProperty* At(std::size_t place) const;
    // Requires: a value there.
    boost::shared_ptr<ICIMProperty> Shared(std::size_t place) const;
    // Requires: a place without a value.
    TInmemProperty& Make(std::size_t place);
    bool IsExpected(const std::string& name) const;
    std::size_t PlaceFor(const std::string& name, const boost::shared_ptr<ICIMClass>& instanceClass,
                         const TCIMContext& context);

    std::shared_ptr<TInmemLayout> fLayout;
    boost::shared_ptr<TBlock> fBlock;                      // keeps its size: somebody may hold a property of it
    std::vector<boost::shared_ptr<TInmemProperty>> fLater; // at the places after the block; null or absent when unset
    std::size_t fNext = 0;                                 // the place after the one that was set last
};

} // namespace NKOLVRX20
