// SPDX-License-Identifier: MIT
#include "host/inmem/InstanceValues.h"

#include "host/inmem/ObjectNames.h"

#include <host/ICIMClass.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>

#include <utility>

namespace NKOLVRX20 {
namespace {

// Returns: null for a property that the class lacks: it is kept and shown with its plain text.
boost::shared_ptr<ICIMPropertyDecl> FindDeclaration(const boost::shared_ptr<ICIMClass>& instanceClass,
                                                    const std::string& name, const TCIMContext& context)
{
    try {
        return instanceClass ? instanceClass->GetPropertyDecl(name, context) : nullptr;
    } catch (const TVRXException& e) {
        if (e.GetStatusCode() != TVRXStatusCode::kUnknownProperty) {
            throw;
        }
        return nullptr;
    }
}

} // namespace

boost::shared_ptr<ICIMProperty> TInmemValues::Find(const std::string& name)
{
    const std::size_t place = fLayout->Find(NormalizedName(name));
    return IsSet(place) ? PropertyAt(place) : nullptr;
}

std::vector<boost::shared_ptr<ICIMProperty>> TInmemValues::All()
{
    std::vector<boost::shared_ptr<ICIMProperty>> properties;
    properties.reserve(fEntries.size());
    for (const std::size_t place : fLayout->InOrder()) {
        if (IsSet(place)) {
            properties.push_back(PropertyAt(place));
        }
    }
    return properties;
}

void TInmemValues::Set(const std::string& name, TCIMValue value, const boost::shared_ptr<ICIMClass>& instanceClass,
                       const TCIMContext& context)
{
    const std::size_t place = IsExpected(name) ? fNext : PlaceFor(name, instanceClass, context);
    if (fEntries.empty()) {
        fEntries.reserve(fLayout->Size());
    }
    if (place >= fEntries.size()) {
        fEntries.resize(place + 1);
    }
    TEntry& entry = fEntries[place];
    if (entry.fProperty) {
        entry.fProperty->SetValue(std::move(value), context);
    } else {
        entry.fValue = std::move(value);
        entry.fIsSet = true;
    }
    fNext = place + 1;
}

// Most instances are given the same names in the same order as the one before.
bool TInmemValues::IsExpected(const std::string& name) const
{
    return fNext < fLayout->Size() && fLayout->At(fNext)->fGivenName == name &&
           !fLayout->At(fNext)->fDeclaration.expired();
}

// A member without a declaration is looked up for every instance: the class may have got one since.
std::size_t TInmemValues::PlaceFor(const std::string& name, const boost::shared_ptr<ICIMClass>& instanceClass,
                                   const TCIMContext& context)
{
    std::string key = NormalizedName(name);
    const std::size_t place = fLayout->Find(key);
    const bool isKnown = place != TInmemLayout::kNowhere;
    if (isKnown && (IsSet(place) || !fLayout->At(place)->fDeclaration.expired())) {
        return place;
    }
    const auto declaration = FindDeclaration(instanceClass, name, context);
    if (isKnown && !declaration && fLayout->At(place)->fGivenName == name) {
        return place;
    }
    const std::string spelling = declaration ? declaration->GetName(TCIMContext()) : name;
    // Not std::make_shared: its unique symbol would keep the library in the process for ever.
    std::shared_ptr<const TInmemMember> member(
        new TInmemMember{name, std::move(key), spelling, declaration, instanceClass});
    TInmemLayout::MakeWritable(fLayout);
    if (isKnown) {
        fLayout->Replace(place, std::move(member));
        return place;
    }
    return fLayout->Append(std::move(member));
}

const boost::shared_ptr<TInmemProperty>& TInmemValues::PropertyAt(std::size_t place)
{
    TEntry& entry = fEntries[place];
    if (!entry.fProperty) {
        entry.fProperty = boost::make_shared<TInmemProperty>(fLayout->At(place), std::move(entry.fValue));
    }
    return entry.fProperty;
}

} // namespace NKOLVRX20
