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

namespace vrxhost {

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
    TCollector collector(*record.fNamespace, losses, [&stop] { return stop.IsStopped(); });
    collector.SetSink(report.BeginStream(), options.fCommand->NeedsInstances());
    try {
        options.fCommand->Fill(collector, document);
        report.Show(std::move(document));
    } catch (const TRequestError& e) {
        report.Fail(e.what());
    }
    return report.Finish();
}

} // namespace vrxhost
