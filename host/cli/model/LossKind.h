// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>

namespace vrxhost {

// What a loss is about. Set where the loss is made; the doctor's advice follows from it alone.
enum class ELossKind
{
    kOther,

    kNotDeployed, // the root is not a deployed tree
    kRoot,        // it cannot be entered
    kBusyRoot,
    kForeignWriter, // another user may change what runs
    kNoState,       // no place to write in
    kState,
    kSettings,

    kPluginLoad,
    kPluginKind, // the library lacks an entry point
    kPlugin,

    kServer,
    kServerProgram, // one of the server's programs failed
    kSchema,        // a MOF file did not compile

    kNoVendor,
    kClassName,
    kClassList,
    kTimeout, // of a class list
    kNoClassList,
    kNoRegistration,
    kNoCapabilities,
    kOtherNamespace, // registered in another namespace than the class list has
    kProviderName,   // a registration names a provider or module without an instance
    kLibrary,
    kLocation, // of a library that is in no vendor's folder

    kClass,
    kInstances,
    kInstancesLate,
    kDeadline,
    kEmbeddedObject,
    kUndeclaredProperty,
    kPropertyType,
    kUndeclaredKey, // a provider uses as a key what the class does not declare as one

    kMofPortability, // works here, fails on OpenPegasus
    kProviderPortability
};

constexpr std::size_t kLossKinds = static_cast<std::size_t>(ELossKind::kProviderPortability) + 1;

// Returns: whether a table has a row for each kind, in the order of the kinds.
template <typename TRow, std::size_t count> constexpr bool IsTableOfKinds(const TRow (&rows)[count])
{
    bool isInOrder = count == kLossKinds;
    for (std::size_t i = 0; i < count && isInOrder; ++i) {
        isInOrder = rows[i].fKind == static_cast<ELossKind>(i);
    }
    return isInOrder;
}

// Returns: the kind as a word, "no-class-list", as records have it.
std::string WordOf(ELossKind kind);

// Returns: the kind of a word; kOther for the words of a later version.
ELossKind KindOf(const std::string& word);

} // namespace vrxhost
