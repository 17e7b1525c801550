// SPDX-License-Identifier: MIT
// Commands that show instances of one class.
#include "host/cli/collect/ClassReader.h"
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Names.h"

#include <host/ICIMClass.h>

#include <algorithm>

namespace vrxhost {
namespace {

void RequireProperty(const TClassRecord& each, const std::string& name)
{
    std::vector<std::string> names;
    for (const TPropertyDeclRecord& property : each.fProperties) {
        names.push_back(property.fName);
    }
    if (!each.Find(name)) {
        throw TRequestError("class " + each.fName + " has no property " + name + Suggestion(name, names));
    }
}

std::string RefuseCondition(const std::string& text)
{
    return text.find('=') == std::string::npos ? "PROPERTY=VALUE is expected, not \"" + text + "\"" : "";
}

class TInstancesCommand : public ICommand
{
  public:
    const char* GetName() const override { return "instances"; }
    const char* GetPurpose() const override { return "Show one class's instances"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddText("CLASS", fName, "The class's name; letter case is ignored");
        arguments.AddRepeatedOption("--where", fWhere, RefuseCondition,
                                    "PROPERTY=VALUE: instances with this value or text; several times: all of them");
        arguments.AddListOption("--props", fProperties, "Properties to show, separated by commas");
    }
    void Fill(TCollector& from, TDocument& into) const override
    {
        const auto found = from.FindClass(fName);
        TClassRecord declared;
        declared.fName = found->GetName({});
        ReadDeclarations(*found, declared);
        CheckNames(declared);
        into.fDetail = EDetail::kInstances;
        into.fIsOneClass = true;
        TClassRecord record = from.ReadClass(
            *found, into.fDetail, [this](TInstanceRecord& instance) { return IsWanted(instance) && Trim(instance); });
        into.fProviders = {{"", "", "", {std::move(record)}}};
    }

  private:
    void CheckNames(const TClassRecord& each) const
    {
        for (const std::string& condition : fWhere) {
            RequireProperty(each, condition.substr(0, condition.find('=')));
        }
        for (const std::string& name : fProperties) {
            RequireProperty(each, name);
        }
    }

    bool IsWanted(const TInstanceRecord& instance) const
    {
        return std::all_of(fWhere.begin(), fWhere.end(), [&instance](const std::string& condition) {
            const std::size_t equals = condition.find('=');
            const TPropertyRecord* const property = instance.Find(condition.substr(0, equals));
            const std::string wanted = condition.substr(equals + 1);
            return property && (IsSame(property->fText, wanted) || property->fValue.ToString(10) == wanted);
        });
    }

    // Removes the properties that were not asked for. Returns: true.
    bool Trim(TInstanceRecord& instance) const
    {
        const auto isUnwanted = [this](const TPropertyRecord& property) {
            return std::none_of(fProperties.begin(), fProperties.end(),
                                [&property](const std::string& name) { return IsSame(name, property.fName); });
        };
        if (!fProperties.empty()) {
            auto& all = instance.fProperties;
            all.erase(std::remove_if(all.begin(), all.end(), isUnwanted), all.end());
        }
        return true;
    }

    std::string fName;
    std::vector<std::string> fWhere;
    std::vector<std::string> fProperties;
};

class TGetCommand : public ICommand
{
  public:
    const char* GetName() const override { return "get"; }
    const char* GetPurpose() const override { return "Show the instance of a path"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddText("PATH", fPath, "Class.Key=\"value\",... as the JSON document has it");
    }
    // Through the class, so that a mistyped path can be answered with the most similar one.
    void Fill(TCollector& from, TDocument& into) const override
    {
        std::vector<std::string> paths;
        const auto found = from.FindClass(fPath.substr(0, fPath.find('.')));
        TClassRecord record = from.ReadClass(*found, EDetail::kInstances, [&](TInstanceRecord& instance) {
            paths.push_back(instance.fPath);
            return instance.fPath == fPath;
        });
        if (std::find(paths.begin(), paths.end(), fPath) == paths.end()) {
            throw TRequestError("there is no instance " + fPath + Suggestion(fPath, paths));
        }
        into.fDetail = EDetail::kInstances;
        into.fIsOneClass = true;
        into.fProviders = {{"", "", "", {std::move(record)}}};
    }

  private:
    std::string fPath;
};

} // namespace

void AddInstanceCommands(TCommands& commands)
{
    commands.push_back(std::make_shared<TInstancesCommand>());
    commands.push_back(std::make_shared<TGetCommand>());
}

} // namespace vrxhost
