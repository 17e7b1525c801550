// SPDX-License-Identifier: MIT
#include "host/inmem/InstanceValues.h"

#include "host/inmem/ObjectNames.h"

#include <host/ICIMClass.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>

#include <algorithm>
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

TInmemValues::TInmemValues(const ICIMClass* instanceClass)
    : fLayout(TInmemLayout::Of(instanceClass)), fBlock(boost::make_shared<TBlock>(fLayout->Size()))
{
}

boost::shared_ptr<ICIMProperty> TInmemValues::Find(const std::string& name) const
{
    const std::size_t place = fLayout->Find(NormalizedName(name));
    return At(place) ? Shared(place) : nullptr;
}

void TInmemValues::Visit(const TPropertyVisitor& visitor) const
{
    const TInmemValues kept = *this; // the visitor may set values, which can make another layout
    for (const std::size_t place : kept.fLayout->InOrder()) {
        if (kept.At(place) && !visitor(kept.Shared(place))) {
            return;
        }
    }
}

TInmemProperty* TInmemValues::At(std::size_t place) const
{
    if (place < fBlock->size()) {
        return (*fBlock)[place].IsSet() ? &(*fBlock)[place] : nullptr;
    }
    const std::size_t later = place - fBlock->size();
    return later < fLater.size() ? fLater[later].get() : nullptr;
}

boost::shared_ptr<ICIMProperty> TInmemValues::Shared(std::size_t place) const
{
    if (place < fBlock->size()) {
        return boost::shared_ptr<ICIMProperty>(fBlock, &(*fBlock)[place]);
    }
    return fLater[place - fBlock->size()];
}

void TInmemValues::Set(const std::string& name, TCIMValue&& value, const boost::shared_ptr<ICIMClass>& instanceClass,
                       const TCIMContext& context)
{
    const std::size_t place = IsExpected(name) ? fNext : PlaceFor(name, instanceClass, context);
    fNext = place + 1;
    if (TInmemProperty* const property = At(place)) {
        property->ReplaceValue(std::move(value));
    } else {
        Make(place).Set(fLayout->At(place), std::move(value));
    }
}

TInmemProperty& TInmemValues::Make(std::size_t place)
{
    if (place < fBlock->size()) {
        return (*fBlock)[place];
    }
    const std::size_t later = place - fBlock->size();
    fLater.resize(std::max(fLater.size(), later + 1));
    fLater[later] = boost::make_shared<TInmemProperty>();
    return *fLater[later];
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
    if (isKnown && (At(place) || !fLayout->At(place)->fDeclaration.expired())) {
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

} // namespace NKOLVRX20
