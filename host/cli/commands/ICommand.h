// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/commands/IArguments.h"
#include "host/cli/model/Document.h"

#include <memory>
#include <string>
#include <vector>

namespace vrxhost {

class TCollector;

// A command of the command line that works on an open namespace. One class a command.
class ICommand
{
  public:
    virtual ~ICommand() = default;

    virtual const char* GetName() const = 0;
    virtual const char* GetPurpose() const = 0; // one line of the help

    // Declares the command's own arguments and options, which are read into this object.
    virtual void AddArguments(IArguments& arguments);

    // Returns: whether Fill looks at the instances itself; they are kept for it then, whatever takes them besides.
    virtual bool NeedsInstances() const { return false; }

    // Returns: the record that the command itself names as its machine, in place of --replay; empty for none.
    virtual std::string GetReplay() const { return ""; }

    // Returns: whether formats that write instances as they come do so; a comparison needs both sides first.
    virtual bool IsStreamed() const { return true; }

    // Returns: whether the format can hold what the command shows.
    virtual bool IsShownAs(const std::string& format) const;

    // Returns: why the command needs the machine itself, as a sentence; null when a record serves as well.
    virtual const char* WhyNotReplayed() const { return nullptr; }

    // Collects what the command shows.
    // Throws: TRequestError for something that does not exist; nothing is shown then.
    // Blocks: as long as the vendors.
    virtual void Fill(TCollector& from, TDocument& into) const = 0;

    // Returns: whether what the tree consists of is to be looked at before anything is started.
    virtual bool LooksAtTree() const { return false; }

    // Adds what follows from the losses. Called once before anything is shown, also when there is nothing else to show
    // because the root was refused or the server did not start.
    virtual void Complete(TDocument& document) const;
};

using TCommands = std::vector<std::shared_ptr<ICommand>>;

// Each file of this folder adds its commands; MakeCommands calls them all, in the order of the help.
void AddListCommands(TCommands& commands);
void AddInstanceCommands(TCommands& commands);
void AddInvokeCommand(TCommands& commands);
void AddDoctorCommand(TCommands& commands);
void AddRecordCommand(TCommands& commands);
void AddDiffCommand(TCommands& commands);
void AddSummaryCommands(TCommands& commands);

TCommands MakeCommands();

// Returns: "Vendor NAME  7 classes, 23 instances".
TFact DescribeVendor(const TProviderRecord& provider);

} // namespace vrxhost
