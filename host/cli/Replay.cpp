// SPDX-License-Identifier: MIT
#include "host/cli/Replay.h"

#include "host/cli/TReport.h"
#include "host/cli/TStatusLine.h"
#include "host/cli/TStopSignals.h"
#include "host/cli/collect/TCollector.h"
#include "host/cli/losses/TLossLog.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/record/TRecordReader.h"

#include <iostream>
#include <map>
#include <string>
#include <vector>

namespace vrxhost {
namespace {

// The times of the machine; what was measured here is the reading of the record.
void SetTimes(std::vector<TProviderRecord>& providers, const std::map<std::string, long>& milliseconds)
{
    for (TProviderRecord& provider : providers) {
        for (TClassRecord& each : provider.fClasses) {
            const auto recorded = milliseconds.find(each.fName);
            each.fMilliseconds = recorded == milliseconds.end() ? 0 : recorded->second;
        }
    }
}

} // namespace

EExitStatus Replay(const TOptions& options)
{
    const TStopSignals stop("", [] {});
    const TRecord record = ReadRecordFile(options.fReplay);
    TLossLog losses("");
    for (const TLoss& loss : record.fLosses) {
        losses.Add(loss);
    }
    TStatusLine status(false);
    TReport report(options, stop, losses, status);
    report.SetRecordedHead(record.fHead);
    for (const std::string& line : record.fLog) {
        if (options.fVerbose) {
            std::cerr << line << '\n';
        }
    }
    TDocument document;
    document.fHead = report.GetHead();
    TCollector collector(*record.fNamespace, losses, [&] { return stop.IsStopped() || report.HasBrokenOff(); });
    collector.SetSink(options.fCommand->IsStreamed() ? report.BeginStream() : nullptr,
                      options.fCommand->NeedsInstances());
    try {
        options.fCommand->Fill(collector, document);
        SetTimes(document.fProviders, record.fMilliseconds);
        report.Show(std::move(document));
    } catch (const TRequestError& e) {
        report.Fail(e);
    }
    return report.Finish();
}

} // namespace vrxhost
