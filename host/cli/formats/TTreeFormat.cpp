// SPDX-License-Identifier: MIT
// Where devices belong, as the associations say it.
#include "host/cli/formats/AssociationTree.h"
#include "host/cli/formats/IFormat.h"
#include "host/cli/formats/TextLayout.h"
#include "host/cli/formats/ValueText.h"
#include "host/cli/model/Printable.h"

#include <set>
#include <sstream>

namespace vrxhost {
namespace {

// Devices below what they belong to, then what no association names. The last instance may decide where the first one
// belongs, so the tree is written at the end; until then the names and the links are held, and no other property.
class TTreeFormat : public IFormat, public IInstanceSink
{
  public:
    explicit TTreeFormat(const TFormatOptions& options) : fOptions(options) {}

    IInstanceSink* BeginStream(const TDocumentHead&) override
    {
        fIsStreaming = true;
        return this;
    }

    void BeginClass(const std::string&, const TClassRecord&) override {}

    void Add(const TClassRecord& each, const TInstanceRecord& instance) override
    {
        if (!each.fIsAssociation || !fLinks.Add(each, instance)) {
            fLabels += PathLabel(instance.fPath) + "\n";
        }
        fIsEmpty = false;
    }

    std::string Finish(const TDocument& document) override
    {
        if (!fIsStreaming) {
            AddInstances(document);
        }
        const std::string partial = Partial(document);
        if (fIsEmpty && partial.empty()) {
            return MakeTableFormat(fOptions, nullptr)->Finish(document);
        }
        const std::vector<TLinkedObject> objects = fLinks.GetObjects();
        return AssociationTree(objects, "") + partial + Unlinked(objects);
    }

  private:
    void AddInstances(const TDocument& document)
    {
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                for (const TInstanceRecord& instance : each.fInstances) {
                    Add(each, instance);
                }
            }
        }
    }

    static std::string Partial(const TDocument& document)
    {
        std::string lines;
        for (const TProviderRecord& provider : document.fProviders) {
            lines += provider.fIsPartial ? "partial: provider " + Printable(provider.fName) + " was given up\n" : "";
        }
        return lines;
    }

    std::string Unlinked(const std::vector<TLinkedObject>& objects) const
    {
        std::set<std::string> linked;
        AddLabels(objects, linked);
        std::string lines;
        std::istringstream labels(fLabels);
        for (std::string label; std::getline(labels, label);) {
            lines += linked.count(label) == 0 ? label + "\n" : "";
        }
        return lines;
    }

    static void AddLabels(const std::vector<TLinkedObject>& objects, std::set<std::string>& labels)
    {
        for (const TLinkedObject& object : objects) {
            labels.insert(PathLabel(object.fPath));
            AddLabels(object.fParts, labels);
        }
    }

    const TFormatOptions fOptions;
    bool fIsStreaming = false;
    bool fIsEmpty = true;
    TLinks fLinks;
    std::string fLabels; // of all other instances, a line each
};

} // namespace

std::unique_ptr<IFormat> MakeTreeFormat(const TFormatOptions& options)
{
    return std::make_unique<TTreeFormat>(options);
}

} // namespace vrxhost
