// SPDX-License-Identifier: MIT
#include "host/cli/model/LossKind.h"

#include <algorithm>
#include <iterator>

namespace vrxhost {
namespace {

struct TWordRow
{
    ELossKind fKind;
    const char* fWord;
};

constexpr TWordRow kWords[] = {
    {ELossKind::kOther, "other"},
    {ELossKind::kNotDeployed, "not-deployed"},
    {ELossKind::kRoot, "root"},
    {ELossKind::kBusyRoot, "busy-root"},
    {ELossKind::kForeignWriter, "foreign-writer"},
    {ELossKind::kNoState, "no-state"},
    {ELossKind::kState, "state"},
    {ELossKind::kSettings, "settings"},
    {ELossKind::kPluginLoad, "plugin-load"},
    {ELossKind::kPluginKind, "plugin-kind"},
    {ELossKind::kPlugin, "plugin"},
    {ELossKind::kServer, "server"},
    {ELossKind::kServerProgram, "server-program"},
    {ELossKind::kSchema, "schema"},
    {ELossKind::kNoVendor, "no-vendor"},
    {ELossKind::kClassName, "class-name"},
    {ELossKind::kClassList, "class-list"},
    {ELossKind::kTimeout, "timeout"},
    {ELossKind::kNoClassList, "no-class-list"},
    {ELossKind::kNoRegistration, "no-registration"},
    {ELossKind::kNoCapabilities, "no-capabilities"},
    {ELossKind::kOtherNamespace, "other-namespace"},
    {ELossKind::kProviderName, "provider-name"},
    {ELossKind::kLibrary, "library"},
    {ELossKind::kLocation, "location"},
    {ELossKind::kClass, "class"},
    {ELossKind::kInstances, "instances"},
    {ELossKind::kInstancesLate, "instances-late"},
    {ELossKind::kDeadline, "deadline"},
    {ELossKind::kEmbeddedObject, "embedded-object"},
    {ELossKind::kUndeclaredProperty, "undeclared-property"},
    {ELossKind::kPropertyType, "property-type"},
    {ELossKind::kUndeclaredKey, "undeclared-key"},
    {ELossKind::kMofPortability, "mof-portability"},
    {ELossKind::kProviderPortability, "provider-portability"},
};
static_assert(IsTableOfKinds(kWords));

} // namespace

std::string WordOf(ELossKind kind)
{
    return kWords[static_cast<std::size_t>(kind)].fWord;
}

ELossKind KindOf(const std::string& word)
{
    const auto found =
        std::find_if(std::begin(kWords), std::end(kWords), [&word](const TWordRow& row) { return row.fWord == word; });
    return found == std::end(kWords) ? ELossKind::kOther : found->fKind;
}

} // namespace vrxhost
