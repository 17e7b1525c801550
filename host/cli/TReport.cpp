// SPDX-License-Identifier: MIT
#include "host/cli/TReport.h"

#include "host/cli/model/ErrorReport.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

namespace vrxhost {

TReport::TReport(const TOptions& options, const TStopSignals& stop, TLossLog& losses, TStatusLine& line)
    : fOptions(options), fStop(stop), fLosses(losses), fLine(line), fHead(MakeHead(options.fCommandName)),
      fFormat(MakeFormat(options.fFormat, options.fFormatOptions, [this](const std::string& text) { Write(text); }))
{
}

void TReport::SetRecordedHead(const TDocumentHead& head)
{
    const std::string command = fHead.fCommand;
    fHead = head;
    fHead.fCommand = command;
}

IInstanceSink* TReport::BeginStream()
{
    return fFormat->BeginStream(fHead);
}

void TReport::Show(TDocument document)
{
    if (std::exchange(fShown, true)) {
        return;
    }
    fInterrupted = fStop.IsStopped();
    if (fInterrupted) {
        fLosses.Add("interrupted");
    }
    if (fHead.fEnded.empty()) {
        fHead.fEnded = TimeNow();
    }
    document.fHead = fHead;
    document.fRoot = fOptions.fReplay.empty() ? fOptions.fRoot : "";
    document.fLogFile = fOptions.fLogFile;
    document.fLosses = fLosses.GetLosses();
    RunFinish(document);
    ReportLosses(document.fLosses);
    document.fComplete = !fPartial;
    fDiffers = document.fComparison && document.fComparison->HasDifferences();
    Write(fFormat->Finish(document));
}

void TReport::RunFinish(TDocument& document)
{
    document.fComplete =
        std::all_of(document.fLosses.begin(), document.fLosses.end(), [](const TLoss& loss) { return loss.fIsNote; });
    try {
        if (document.fFinish) {
            document.fFinish(document);
        }
        fOptions.fCommand->Complete(document);
    } catch (const std::runtime_error& e) {
        fFailed = true;
        document.fLosses.push_back(LossOf(e));
    }
}

int TReport::WriteAll(const std::string& text)
{
    if (!fOutput.IsTerminal()) {
        return fOutput.Write(text, fStop.GetFd());
    }
    const TStatusLine::TGap gap(fLine);
    return fOutput.Write(text, fStop.GetFd());
}

// What follows a piece that was not written is left out: a later piece would make a document with a hole.
void TReport::Write(const std::string& text)
{
    const int error = fBrokeOff ? 0 : WriteAll(text);
    fBrokeOff |= error != 0;
    if (error == ECANCELED) {
        fInterrupted = true;
    } else if (error != 0) {
        fFailed = true;
        if (error != EPIPE) { // a reader that has seen enough and left is not worth a sentence
            ReportError(std::string("the document could not be written: ") + std::strerror(error));
        }
    }
}

void TReport::Fail(const std::exception& reason)
{
    if (!fStop.IsStopped()) {
        fFailed = true;
        fLosses.AddHeldBack();
        fLosses.Add(LossOf(reason));
    }
    Show(TDocument());
}

EExitStatus TReport::Finish()
{
    if (fStop.IsStopped()) {
        Show(TDocument());
    } else {
        ReportLosses(fLosses.GetLosses());
    }
    if (fInterrupted) {
        return kInterrupted;
    }
    if (fFailed) {
        return kFailed;
    }
    if (fDiffers) {
        return kDifferent;
    }
    return fPartial ? kPartial : kComplete;
}

// Reports the losses that were not reported before, each with the server's lines about its vendor.
void TReport::ReportLosses(const std::vector<TLoss>& losses)
{
    for (const TLoss& loss : losses) {
        fPartial |= !loss.fIsNote;
        const std::string text = loss.GetText();
        if (!fReported.insert(text).second) {
            continue;
        }
        ReportError((loss.fIsNote ? "note: " : "") + text);
        for (const std::string& line : loss.fLog) {
            ReportError("  server log: " + line);
        }
    }
}

} // namespace vrxhost
