// SPDX-License-Identifier: MIT
// Commands that list whatever the providers serve, and the declaration of one class.
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"

#include <host/ICIMClass.h>

namespace vrxhost {
namespace {

class TInventoryCommand : public ICommand
{
  public:
    const char* GetName() const override { return "inventory"; }
    const char* GetPurpose() const override { return "Show every provider's classes and their instances"; }
    void Fill(TCollector& from, TDocument& into) const override
    {
        into.fDetail = EDetail::kInstances;
        into.fProviders = from.ReadProviders(into.fDetail);
    }
};

class TProvidersCommand : public ICommand
{
  public:
    const char* GetName() const override { return "providers"; }
    const char* GetPurpose() const override { return "List the providers and their classes"; }
    void Fill(TCollector& from, TDocument& into) const override
    {
        into.fDetail = EDetail::kNames;
        into.fProviders = from.ReadProviders(into.fDetail);
    }
};

class TClassesCommand : public ICommand
{
  public:
    const char* GetName() const override { return "classes"; }
    const char* GetPurpose() const override { return "List the classes with their properties and methods"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddFlag("--tree", fIsTree, "Show the names alone, below their superclasses");
    }
    void Fill(TCollector& from, TDocument& into) const override
    {
        into.fDetail = EDetail::kDeclarations;
        into.fIsTree = fIsTree;
        into.fProviders = from.ReadProviders(into.fDetail);
    }

  private:
    bool fIsTree = false;
};

class TClassCommand : public ICommand
{
  public:
    const char* GetName() const override { return "class"; }
    const char* GetPurpose() const override { return "Show the declaration of one class"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddText("CLASS", fName, "The class's name; letter case is ignored");
    }
    void Fill(TCollector& from, TDocument& into) const override
    {
        into.fDetail = EDetail::kDeclarations;
        into.fIsOneClass = true;
        into.fProviders = {{"", "", "", {from.ReadClass(*from.FindClass(fName), into.fDetail)}}};
    }

  private:
    std::string fName;
};

} // namespace

void ICommand::AddArguments(IArguments&) {}

void ICommand::Complete(TDocument&) const {}

bool ICommand::IsShownAs(const std::string&) const
{
    return true;
}

void AddListCommands(TCommands& commands)
{
    commands.push_back(std::make_shared<TInventoryCommand>());
    commands.push_back(std::make_shared<TProvidersCommand>());
    commands.push_back(std::make_shared<TClassesCommand>());
    commands.push_back(std::make_shared<TClassCommand>());
}

TCommands MakeCommands()
{
    TCommands commands;
    AddSummaryCommands(commands);
    AddListCommands(commands);
    AddInstanceCommands(commands);
    AddInvokeCommand(commands);
    AddRecordCommand(commands);
    AddDiffCommand(commands);
    return commands;
}

} // namespace vrxhost
