// SPDX-License-Identifier: MIT
// Where devices belong, as the associations say it.
#include "host/cli/formats/AssociationTree.h"
#include "host/cli/formats/IFormat.h"
#include "host/cli/formats/TextLayout.h"
#include "host/cli/formats/ValueText.h"

namespace vrxhost {
namespace {

// Devices below what they belong to, then what no association names.
class TTreeFormat : public IFormat
{
  public:
    explicit TTreeFormat(const TFormatOptions& options) : fOptions(options) {}

    std::string Finish(const TDocument& document) override
    {
        std::vector<const TClassRecord*> associations;
        std::string rest;
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                if (each.fIsAssociation) {
                    associations.push_back(&each);
                }
            }
        }
        const std::string tree = AssociationTree(associations, "") + Partial(document);
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                rest += each.fIsAssociation ? "" : Unlinked(each, tree);
            }
        }
        return tree.empty() && rest.empty() ? MakeTableFormat(fOptions, nullptr)->Finish(document) : tree + rest;
    }

  private:
    static std::string Partial(const TDocument& document)
    {
        std::string lines;
        for (const TProviderRecord& provider : document.fProviders) {
            lines += provider.fIsPartial ? "partial: provider " + Printable(provider.fName) + " was given up\n" : "";
        }
        return lines;
    }

    static std::string Unlinked(const TClassRecord& each, const std::string& tree)
    {
        std::string lines;
        for (const TInstanceRecord& instance : each.fInstances) {
            const std::string line = PathLabel(instance.fPath) + "\n";
            lines += tree.find(line) == std::string::npos ? line : "";
        }
        return lines;
    }

    const TFormatOptions fOptions;
};

} // namespace

std::unique_ptr<IFormat> MakeTreeFormat(const TFormatOptions& options)
{
    return std::make_unique<TTreeFormat>(options);
}

} // namespace vrxhost
