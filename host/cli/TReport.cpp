#include "host/cli/TReport.h"

#include "host/cli/ErrorReport.h"

#include <cerrno>
#include <cstring>
#include <utility>

namespace vrxhost {

TReport::TReport(const TOptions& options, const TStopSignals& stop, TLossLog& losses)
    : fOptions(options), fStop(stop), fLosses(losses)
{
}

void TReport::Show(std::vector<TProviderRecord> providers)
{
    if (std::exchange(fShown, true)) {
        return;
    }
    fInterrupted = fStop.IsStopped();
    if (fInterrupted) {
        fLosses.Add("interrupted");
    }
    ReportLosses();
    TDocument document;
    document.fCommand = fOptions.fCommand;
    document.fProviders = std::move(providers);
    document.fLosses = fLosses.GetSentences();
    document.fComplete = document.fLosses.empty();
    Write(fOptions.fFormat == EFormat::kJson ? RenderJson(document) : RenderTable(document));
}

void TReport::Write(const std::string& text)
{
    const int error = fOutput.Write(text, fStop.GetFd());
    if (error == ECANCELED) {
        fInterrupted = true;
    } else if (error != 0) {
        fFailed = true;
        if (error != EPIPE) { // a reader that has seen enough and left is not worth a sentence
            ReportError(std::string("the document could not be written: ") + std::strerror(error));
        }
    }
}

void TReport::Fail(const std::string& reason)
{
    if (!fStop.IsStopped()) {
        fFailed = true;
        fLosses.AddHeldBack();
        fLosses.Add(reason);
    }
    Show({});
}

EExitStatus TReport::Finish()
{
    if (fStop.IsStopped()) {
        Show({});
    } else {
        ReportLosses();
    }
    if (fInterrupted) {
        return kInterrupted;
    }
    if (fFailed) {
        return kFailed;
    }
    return fReportedCount == 0 ? kComplete : kPartial;
}

// Reports the losses that were added since the last call.
void TReport::ReportLosses()
{
    const auto sentences = fLosses.GetSentences();
    for (; fReportedCount < sentences.size(); ++fReportedCount) {
        ReportError(sentences[fReportedCount]);
    }
}

} // namespace vrxhost
