// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/Options.h"
#include "host/cli/TDocumentOutput.h"
#include "host/cli/TStatusLine.h"
#include "host/cli/TStopSignals.h"
#include "host/cli/losses/TLossLog.h"
#include "host/cli/model/Document.h"

#include <memory>
#include <set>
#include <string>
#include <vector>

namespace vrxhost {

// What the user gets of a run: one document on standard output, the losses on standard error, and the exit status that
// follows from both.
// Thread: one at a time.
class TReport
{
  public:
    // The arguments outlive the object. line: removed while the document is written to a terminal.
    TReport(const TOptions& options, const TStopSignals& stop, TLossLog& losses, TStatusLine& line);

    // The head of the document: this run's, unless the document is about another's record.
    const TDocumentHead& GetHead() const { return fHead; }
    void SetRecordedHead(const TDocumentHead& head);

    // Returns: what takes the instances while they are collected; null for a format that needs the whole document.
    IInstanceSink* BeginStream();

    // Writes the document, whose head and losses are filled in here; after an interruption it is marked as partial.
    // Later calls are ignored. Blocks: until the reader has taken it all; after an interruption half a second at most.
    void Show(TDocument document);

    // For a run that failed before its inventory: enters the reason as a loss and shows a document with an empty list
    // of providers.
    void Fail(const std::exception& reason);

    // Returns: whether the document cannot be written any more, as when its reader has left.
    bool HasBrokenOff() const { return fBrokeOff; }

    // Reports the losses since the document. Requires: the plug-in's work is over.
    // Returns: the document's status when it was written whole, also if an interruption came later.
    EExitStatus Finish();

  private:
    void RunFinish(TDocument& document);
    void Write(const std::string& text);
    int WriteAll(const std::string& text);
    void ReportLosses(const std::vector<TLoss>& losses);

    const TOptions& fOptions;
    const TStopSignals& fStop;
    TLossLog& fLosses;
    TStatusLine& fLine;
    TDocumentOutput fOutput;
    TDocumentHead fHead;
    const std::unique_ptr<IFormat> fFormat;
    bool fShown = false;
    bool fInterrupted = false; // before the document was written whole
    bool fBrokeOff = false;    // a piece of the document could not be written
    bool fFailed = false;
    bool fPartial = false;
    bool fDiffers = false;
    std::set<std::string> fReported; // the sentences on standard error
};

} // namespace vrxhost
