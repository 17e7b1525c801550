// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMPropertyDecl.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// What a property has in common in all instances of a class. Never changed.
struct TInmemMember
{
    std::string fGivenName; // by which it was set first; the next instance is most often given the same
    std::string fKey;       // normalised
    std::string fName;      // the declaration's spelling, or the given one where the class lacks the property
    boost::weak_ptr<ICIMPropertyDecl> fDeclaration;
    boost::weak_ptr<ICIMClass> fClass;
};

// The members of a class's instances, in the order in which they were set first. Instances of one class that live at
// one time share a layout, so that each of them holds values alone.
// Ownership: instances own it; a table finds it by the class, which every owner keeps alive.
// Thread: one at a time for the instances of a class, as the contract says; distinct classes may be used by distinct
// threads.
class TInmemLayout
{
  public:
    static constexpr std::size_t kNowhere = SIZE_MAX;

    // Returns: the layout of the class's living instances, or a new one. The class may be null.
    static std::shared_ptr<TInmemLayout> Of(const ICIMClass* instanceClass);
    // Makes the layout the caller's own, in order to change it: a copy when others hold it. Instances that are made
    // later begin with it.
    static void MakeWritable(std::shared_ptr<TInmemLayout>& layout);

    ~TInmemLayout();
    TInmemLayout& operator=(const TInmemLayout&) = delete;

    std::size_t Size() const { return fMembers.size(); }
    const std::shared_ptr<const TInmemMember>& At(std::size_t place) const { return fMembers[place]; }
    // Returns: kNowhere when the layout lacks it.
    std::size_t Find(const std::string& key) const;
    // The places in byte order of the keys.
    const std::vector<std::uint32_t>& InOrder() const { return fOrder; }

    // Returns: the new member's place.
    std::size_t Append(std::shared_ptr<const TInmemMember> member);
    // Requires: a member of the same key.
    void Replace(std::size_t place, std::shared_ptr<const TInmemMember> member) { fMembers[place] = std::move(member); }

  private:
    explicit TInmemLayout(const ICIMClass* instanceClass) : fClass(instanceClass) {}
    TInmemLayout(const TInmemLayout&) = default;
    std::vector<std::uint32_t>::const_iterator NotBefore(const std::string& key) const;

    const ICIMClass* fClass; // for the table alone
    std::vector<std::shared_ptr<const TInmemMember>> fMembers;
    std::vector<std::uint32_t> fOrder;
};

} // namespace NKOLVRX20
