// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"

#include <memory>
#include <string>
#include <vector>

namespace CLI {
class App;
}

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
    virtual void AddArguments(CLI::App& command);

    // Returns: whether Fill looks at the instances itself; they are kept for it then, whatever takes them besides.
    virtual bool NeedsInstances() const { return false; }

    // Collects what the command shows.
    // Throws: TRequestError for something that does not exist; nothing is shown then.
    // Blocks: as long as the vendors.
    virtual void Fill(TCollector& from, TDocument& into) const = 0;
};

using TCommands = std::vector<std::shared_ptr<ICommand>>;

// Each file of this folder adds its commands; MakeCommands calls them all, in the order of the help.
void AddListCommands(TCommands& commands);
void AddInstanceCommands(TCommands& commands);
void AddInvokeCommand(TCommands& commands);
void AddSummaryCommands(TCommands& commands);

TCommands MakeCommands();

} // namespace vrxhost
