// SPDX-License-Identifier: MIT
#pragma once

#include "host/inmem/InstanceLayout.h"
#include "host/inmem/TInmemProperty.h"

namespace NKOLVRX20 {

// The values of one instance, by place in the layout of its class. A property becomes an object when it is asked for.
class TInmemValues
{
  public:
    // The class may be null. It must outlive these values.
    explicit TInmemValues(const ICIMClass* instanceClass) : fLayout(TInmemLayout::Of(instanceClass)) {}

    // Returns: null when the value is unset.
    boost::shared_ptr<ICIMProperty> Find(const std::string& name);
    // In byte order of the normalised names.
    std::vector<boost::shared_ptr<ICIMProperty>> All();
    // Sets one of the class's instances; the context is for the class.
    // Throws: what the class's GetPropertyDecl throws, but for TVRXException 15.
    void Set(const std::string& name, TCIMValue value, const boost::shared_ptr<ICIMClass>& instanceClass,
             const TCIMContext& context);

  private:
    struct TEntry
    {
        TCIMValue fValue; // while there is no object
        boost::shared_ptr<TInmemProperty> fProperty;
        bool fIsSet = false;
    };

    bool IsSet(std::size_t place) const { return place < fEntries.size() && fEntries[place].fIsSet; }
    bool IsExpected(const std::string& name) const;
    std::size_t PlaceFor(const std::string& name, const boost::shared_ptr<ICIMClass>& instanceClass,
                         const TCIMContext& context);
    const boost::shared_ptr<TInmemProperty>& PropertyAt(std::size_t place);

    std::shared_ptr<TInmemLayout> fLayout;
    std::vector<TEntry> fEntries; // by place; the last ones may be absent
    std::size_t fNext = 0;        // the place after the one that was set last
};

} // namespace NKOLVRX20
