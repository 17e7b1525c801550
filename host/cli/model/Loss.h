// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/LossKind.h"

#include <stdexcept>
#include <string>
#include <vector>

namespace vrxhost {

// Something that is missing from the document, or a note about something that may be: a sentence and what it is about.
struct TLoss
{
    ELossKind fKind = ELossKind::kOther;

    // The sentence is fBegin, the objects, fEnd. Losses that differ in the objects alone have one cause.
    std::string fBegin;
    std::vector<std::string> fObjects;
    std::string fEnd;

    std::string fVendor;   // the name of the folder
    std::string fProvider; // the name of the provider whose class list is there; empty where there are none or several
    std::string fFile;     // the vendor's file that the loss is about
    std::vector<std::string> fClasses;
    std::string fProperty;
    std::vector<std::string> fLog; // what the server's log says about the vendor

    bool fIsCause = false;       // a file of a vendor did not compile: what it declares is missing as a consequence
    bool fIsConsequence = false; // may follow from such a file
    bool fIsNote = false;        // the document may be complete all the same

    // Returns: the sentence; the vendor and the file go before it, the consequences of a cause after it.
    std::string GetText() const;
};

// Why something cannot be done, as a sentence.
class TFailure : public std::runtime_error
{
  public:
    TFailure(ELossKind kind, const std::string& sentence) : std::runtime_error(sentence), fKind(kind) {}
    explicit TFailure(const std::string& sentence) : TFailure(ELossKind::kOther, sentence) {}

    ELossKind GetKind() const { return fKind; }

  private:
    ELossKind fKind;
};

// Returns: a loss that is a sentence alone.
TLoss LossOf(ELossKind kind, const std::string& sentence);
TLoss LossOf(const std::string& sentence);
TLoss LossOf(const std::exception& failure);

// Returns: the names, separated by commas.
std::string JoinNames(const std::vector<std::string>& names);

} // namespace vrxhost
