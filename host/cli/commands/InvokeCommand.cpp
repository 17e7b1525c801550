// SPDX-License-Identifier: MIT
// Calls a method of an instance or of a class.
#include "host/cli/collect/ClassReader.h"
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Names.h"
#include "host/cli/model/NoContext.h"

#include <host/ICIMClass.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/TCIMReference.h>

#include <algorithm>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

using TMethodPtr = boost::shared_ptr<ICIMMethodDecl>;
using TParameterPtr = boost::shared_ptr<ICIMParameterDecl>;

// Returns: the element of that name, letter case ignored.
// Throws: TRequestError, "OWNER has no KIND NAME", with the most similar name.
template <typename Pointer>
Pointer Find(const std::vector<Pointer>& all, const std::string& name, const std::string& owner, const char* kind)
{
    std::vector<std::string> names;
    for (const Pointer& each : all) {
        names.push_back(each->GetName(kNoContext));
        if (IsSame(names.back(), name)) {
            return each;
        }
    }
    throw TRequestError(owner + " has no " + kind + " " + name + Suggestion(name, names));
}

std::vector<TMethodPtr> MethodsOf(const ICIMClass& each)
{
    std::vector<TMethodPtr> methods;
    each.EnumerateMethodDecls(
        [&methods](TMethodPtr method) {
            methods.push_back(method);
            return true;
        },
        kNoContext);
    return methods;
}

std::vector<TParameterPtr> ParametersOf(const ICIMMethodDecl& method)
{
    std::vector<TParameterPtr> parameters;
    method.EnumerateParameterDecls(
        [&parameters](TParameterPtr parameter) {
            parameters.push_back(parameter);
            return true;
        },
        kNoContext);
    return parameters;
}

class TInvokeCommand : public ICommand
{
  public:
    const char* GetName() const override { return "invoke"; }
    const char* GetPurpose() const override { return "Call a method of an instance (by its path) or of a class"; }
    void AddArguments(IArguments& arguments) override
    {
        arguments.AddText("TARGET", fTarget, "Class.Key=\"value\",... or a class's name");
        arguments.AddText("METHOD", fMethod, "The method's name; letter case is ignored");
        arguments.AddRest("NAME=VALUE", fArguments, "Input parameters; elements of an array separated by commas");
    }

    const char* WhyNotReplayed() const override { return "a record answers no calls of methods"; }
    void Fill(TCollector& from, TDocument& into) const override
    {
        into.fDetail = EDetail::kNames;
        const auto found = from.FindClass(fTarget.substr(0, fTarget.find('.')));
        const std::string className = found->GetName(kNoContext);
        const TMethodPtr method = Find(MethodsOf(*found), fMethod, "class " + className, "method");
        const std::string name = method->GetName(kNoContext);
        const auto ns = found->GetNamespace(kNoContext);
        const TCIMContext inputs = ReadInputs(*method, name, ns);
        TCIMReference target(ns, kNoContext);
        target.SetPath(fTarget.find('.') == std::string::npos ? className : fTarget);
        TCIMContext outputs;
        TCIMValue returned;
        const std::string error =
            ErrorOf([&] { returned = found->InvokeMethod(target, name, inputs, outputs, kNoContext); });
        if (!error.empty()) {
            throw TRequestError("method " + name + " of " + fTarget + " failed: " + error);
        }
        into.fInvocations = {Report(*method, name, returned, outputs)};
    }

  private:
    TCIMContext ReadInputs(const ICIMMethodDecl& method, const std::string& name,
                           const boost::shared_ptr<ICIMNamespace>& ns) const
    {
        TCIMContext inputs;
        for (const std::string& argument : fArguments) {
            const std::size_t equals = argument.find('=');
            if (equals == std::string::npos) {
                throw TRequestError("NAME=VALUE is expected, not \"" + argument + "\"");
            }
            const TParameterPtr parameter =
                Find(ParametersOf(method), argument.substr(0, equals), "method " + name, "parameter");
            try {
                inputs[parameter->GetName(kNoContext)] =
                    ParseValue(argument.substr(equals + 1), parameter->GetType(kNoContext), ns);
            } catch (const TRequestError& e) {
                throw TRequestError("parameter " + parameter->GetName(kNoContext) + ": " + e.what());
            }
        }
        return inputs;
    }

    static TInvocation Report(const ICIMMethodDecl& method, const std::string& name, const TCIMValue& returned,
                              const TCIMContext& outputs)
    {
        TInvocation invocation;
        invocation.fMethod = name;
        invocation.fReturned = ReadValue("ReturnValue", returned, &method);
        const auto parameters = ParametersOf(method);
        for (const auto& output : outputs) {
            const auto declared = std::find_if(parameters.begin(), parameters.end(), [&](const TParameterPtr& each) {
                return IsSame(each->GetName(kNoContext), output.first);
            });
            invocation.fOutputs.push_back(
                ReadValue(output.first, output.second, declared == parameters.end() ? nullptr : declared->get()));
        }
        return invocation;
    }

    std::string fTarget;
    std::string fMethod;
    std::vector<std::string> fArguments;
};

} // namespace

void AddInvokeCommand(TCommands& commands)
{
    commands.push_back(std::make_shared<TInvokeCommand>());
}

} // namespace vrxhost
