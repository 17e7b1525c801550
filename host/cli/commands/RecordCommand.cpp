// SPDX-License-Identifier: MIT
// Keeps this machine in a file.
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/record/TRecordWriter.h"

namespace vrxhost {
namespace {

class TRecordCommand : public ICommand
{
  public:
    const char* GetName() const override { return "record"; }
    const char* GetPurpose() const override { return "Keep this machine in a file, for --replay and diff"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddPath("FILE", IArguments::ENeed::kRequired, fFile,
                          "The record; one that exists is replaced when the new one is whole");
    }
    const char* WhyNotReplayed() const override { return "a record of it is there"; }

    void Fill(TCollector& from, TDocument& into) const override
    {
        std::shared_ptr<TRecordWriter> writer;
        try {
            writer = std::make_shared<TRecordWriter>(fFile, into.fHead);
        } catch (const std::runtime_error& e) {
            throw TRequestError(e.what());
        }
        into.fDetail = EDetail::kInstances;
        from.SetObserver(writer.get());
        into.fFinish = [writer](TDocument& whole) { writer->Finish(whole); };
        into.fProviders = from.ReadProviders(into.fDetail);
        into.fFacts = {{"Record", fFile}};
        for (const TProviderRecord& provider : into.fProviders) {
            into.fFacts.push_back(DescribeVendor(provider));
        }
    }

  private:
    std::string fFile;
};

} // namespace

void AddRecordCommand(TCommands& commands)
{
    commands.push_back(std::make_shared<TRecordCommand>());
}

} // namespace vrxhost
