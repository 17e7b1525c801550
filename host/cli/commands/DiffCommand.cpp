// SPDX-License-Identifier: MIT
// Compares two records, or a record and this machine.
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"
#include "host/cli/model/Comparison.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/record/TRecordReader.h"

namespace vrxhost {
namespace {

// Read before the other side is asked, so that a record that is refused costs no time.
struct TEarlier
{
    std::vector<TProviderRecord> fProviders;
    std::vector<TLoss> fLosses;
    bool fIsComplete;
};

class TDiffCommand : public ICommand
{
  public:
    const char* GetName() const override { return "diff"; }
    const char* GetPurpose() const override { return "Compare two records, or a record and this machine"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddPath("A", IArguments::ENeed::kRequired, fFrom, "The earlier record");
        arguments.AddPath("B", IArguments::ENeed::kOptional, fTo,
                          "The later record (default: this machine, as it is now)");
    }
    bool NeedsInstances() const override { return true; }
    std::string GetReplay() const override { return fTo; }
    bool IsStreamed() const override { return false; }
    bool IsShownAs(const std::string& format) const override { return format != "tree" && format != "html"; }

    void Fill(TCollector& from, TDocument& into) const override
    {
        const auto earlier = std::make_shared<TEarlier>(ReadEarlier());
        into.fDetail = EDetail::kInstances;
        into.fProviders = from.ReadProviders(into.fDetail);
        into.fFinish = [this, earlier](TDocument& whole) {
            const TSide before{fFrom, earlier->fProviders, earlier->fLosses};
            const TSide after{fTo.empty() ? "this machine" : fTo, whole.fProviders, whole.fLosses};
            whole.fComparison = Compare(before, after);
            if (!earlier->fIsComplete) {
                whole.fLosses.push_back(
                    LossOf("the record " + fFrom + " is partial: something was lost when it was made"));
            }
        };
    }

  private:
    // Throws: TRequestError.
    TEarlier ReadEarlier() const
    {
        try {
            const TRecord record = ReadRecordFile(fFrom);
            TLossLog ignored("");
            TCollector collector(*record.fNamespace, ignored, [] { return false; });
            return {collector.ReadProviders(EDetail::kInstances), record.fLosses, record.fIsComplete};
        } catch (const TRecordError& e) {
            throw TRequestError(e.what());
        }
    }

    std::string fFrom;
    std::string fTo;
};

} // namespace

void AddDiffCommand(TCommands& commands)
{
    commands.push_back(std::make_shared<TDiffCommand>());
}

} // namespace vrxhost
