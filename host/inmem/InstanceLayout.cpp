// SPDX-License-Identifier: MIT
#include "host/inmem/InstanceLayout.h"

#include <algorithm>
#include <map>
#include <mutex>

namespace NKOLVRX20 {
namespace {

// The layouts in use, by class. An address stands for one class: a layout has owners, and they keep its class alive.
struct TLayoutTable
{
    std::mutex fMutex;
    std::map<const ICIMClass*, std::weak_ptr<TInmemLayout>> fLayouts;
};

// Lives until the process ends: instances may be released by static destructors.
TLayoutTable& LayoutTable()
{
    static auto* const fgTable = new TLayoutTable;
    return *fgTable;
}

void Enter(const ICIMClass* instanceClass, const std::shared_ptr<TInmemLayout>& layout)
{
    if (instanceClass) {
        const std::lock_guard<std::mutex> lock(LayoutTable().fMutex);
        LayoutTable().fLayouts[instanceClass] = layout;
    }
}

std::shared_ptr<TInmemLayout> FindLayout(const ICIMClass* instanceClass)
{
    const std::lock_guard<std::mutex> lock(LayoutTable().fMutex);
    const auto found = LayoutTable().fLayouts.find(instanceClass);
    return found == LayoutTable().fLayouts.end() ? nullptr : found->second.lock();
}

} // namespace

std::shared_ptr<TInmemLayout> TInmemLayout::Of(const ICIMClass* instanceClass)
{
    if (auto known = FindLayout(instanceClass)) {
        return known;
    }
    const std::shared_ptr<TInmemLayout> layout(new TInmemLayout(instanceClass));
    Enter(instanceClass, layout);
    return layout;
}

void TInmemLayout::MakeWritable(std::shared_ptr<TInmemLayout>& layout)
{
    if (layout.use_count() > 1) {
        layout.reset(new TInmemLayout(*layout));
        Enter(layout->fClass, layout);
    }
}

TInmemLayout::~TInmemLayout()
{
    const std::lock_guard<std::mutex> lock(LayoutTable().fMutex);
    const auto entry = LayoutTable().fLayouts.find(fClass);
    if (entry != LayoutTable().fLayouts.end() && entry->second.expired()) { // or it is a later layout of the class
        LayoutTable().fLayouts.erase(entry);
    }
}

std::vector<std::uint32_t>::const_iterator TInmemLayout::NotBefore(const std::string& key) const
{
    return std::lower_bound(fOrder.begin(), fOrder.end(), key, [this](std::uint32_t place, const std::string& wanted) {
        return fMembers[place]->fKey < wanted;
    });
}

std::size_t TInmemLayout::Find(const std::string& key) const
{
    const auto found = NotBefore(key);
    return found != fOrder.end() && fMembers[*found]->fKey == key ? *found : kNowhere;
}

std::size_t TInmemLayout::Append(std::shared_ptr<const TInmemMember> member)
{
    const std::size_t place = fMembers.size();
    fOrder.insert(NotBefore(member->fKey), static_cast<std::uint32_t>(place));
    fMembers.push_back(std::move(member));
    return place;
}

} // namespace NKOLVRX20
