// SPDX-License-Identifier: MIT
// What is wrong with the tree, the server and each vendor, and what to do about it.
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace vrxhost {
namespace {

// What a loss is about when it names neither class nor vendor, and what to do.
struct TAdviceRow
{
    ELossKind fKind;
    const char* fSubject;
    const char* fAdvice;
};

constexpr char kStageAgain[] =
    "stage the tree again (cmake --install BUILD --prefix ROOT, or install the package again), or name "
    "another with --root";
constexpr char kReadServerLog[] = "read the server's log from its end, or run pegasus/bin/cimserver by hand";
constexpr char kCorrectSetting[] = "correct the line, or the option --set";

constexpr TAdviceRow kAdvice[] = {
    {ELossKind::kOther, "run", ""},
    {ELossKind::kNotDeployed, "tree", kStageAgain},
    {ELossKind::kRoot, "tree", "name a deployed tree with --root"},
    {ELossKind::kBusyRoot, "tree", "wait until it has ended, or work in another root (--root, --state)"},
    {ELossKind::kForeignWriter, "tree",
     "give it to root or to yourself (chown), and take the right to write from all others (chmod go-w)"},
    {ELossKind::kNoState, "tree", "name a directory that you may write with --state"},
    {ELossKind::kState, "tree", "name a directory of your own, or one that is empty, with --state"},
    {ELossKind::kSettings, "settings", kCorrectSetting},
    {ELossKind::kPluginLoad, "plug-in",
     "install what the loader misses, or stage the tree again; --plugin names another file"},
    {ELossKind::kPluginKind, "plug-in", "stage the tree again; --plugin names another file"},
    {ELossKind::kPlugin, "plug-in", "read the host's log from its end"},
    {ELossKind::kServer, "server", kReadServerLog},
    {ELossKind::kServerProgram, "server", "stage the tree again: one of the programs in pegasus/bin does not work"},
    {ELossKind::kSchema, "schema", "correct the file at that line and column; docs/mof.md describes the language"},
    {ELossKind::kNoVendor, "vendors", "put a vendor's folder there; docs/vendors.md has an example"},
    {ELossKind::kClassName, "vendors", "correct the name in the class list: letters, digits and underscores"},
    {ELossKind::kClassList, "vendors", "correct the class list at that line"},
    {ELossKind::kTimeout, "vendors", "write whole seconds, 4294967 at most, in <timeout> or in CLASS[SECONDS]"},
    {ELossKind::kNoClassList, "vendors", "add NAME.classes.xml; remove the folder when it is not used"},
    {ELossKind::kNoRegistration, "vendors",
     "add NAME.registration.mof with PG_ProviderModule, PG_Provider and PG_ProviderCapabilities; docs/vendors.md has "
     "an example"},
    {ELossKind::kNoCapabilities, "vendors",
     "add an instance of PG_ProviderCapabilities with this ClassName to the registration file"},
    {ELossKind::kOtherNamespace, "vendors",
     "make <nsp> of the class list and Namespaces of the registration file the same"},
    {ELossKind::kProviderName, "vendors",
     "write the same names in PG_ProviderModule, PG_Provider and PG_ProviderCapabilities"},
    {ELossKind::kLibrary, "vendors", "install what is missing, or build the library again"},
    {ELossKind::kLocation, "vendors", "put the library there, or correct Location in the registration file"},
    {ELossKind::kClass, "vendors",
     "declare the class in a *.properties.mof of the folder, or correct its name in the class list"},
    {ELossKind::kInstances, "vendors", "see in the server's log why the provider failed"},
    {ELossKind::kInstancesLate, "vendors",
     "see in the server's log what the provider waits for, or give the class a longer timeout: CLASS[SECONDS]"},
    {ELossKind::kDeadline, "vendors", "see in the server's log what the provider waits for, or raise --deadline"},
    {ELossKind::kEmbeddedObject, "vendors",
     "nothing, when the text is enough; else declare properties of simple types"},
    {ELossKind::kUndeclaredProperty, "vendors", "declare the property in the class's MOF, or leave it unset"},
    {ELossKind::kPropertyType, "vendors", "use the same type in the class's MOF and in the provider"},
    {ELossKind::kUndeclaredKey, "vendors", "give the property the qualifier Key in the class's MOF"},
    {ELossKind::kMofPortability, "schema", "change the text as docs/mof.md says under Portability"},
    {ELossKind::kProviderPortability, "vendors", "change the provider's call as docs/vendors.md says"},
};
static_assert(IsTableOfKinds(kAdvice));

std::string LogFiles(const TDocument& document)
{
    const std::string server = document.fRoot.empty() ? "" : document.fRoot + "/pegasus/cimserver.log";
    return document.fLogFile + (document.fLogFile.empty() || server.empty() ? "" : " and ") + server;
}

TCheck CheckOf(const TLoss& loss, const TDocument& document)
{
    const TAdviceRow& row = kAdvice[static_cast<std::size_t>(loss.fKind)];
    TCheck check;
    check.fSubject = loss.fVendor.empty() ? row.fSubject : "vendor " + loss.fVendor;
    check.fIsOk = check.fIsNote = loss.fIsNote;
    check.fText = loss.GetText();
    check.fAdvice = row.fAdvice;
    check.fLog = loss.fLog;
    const std::string logs = loss.fIsNote ? "" : LogFiles(document);
    if (!logs.empty()) {
        check.fAdvice += (check.fAdvice.empty() ? "read " : "; logs: ") + logs;
    }
    return check;
}

void AddClassChecks(const TLoss& loss, TDocument& document)
{
    for (std::size_t i = 0; i < loss.fClasses.size(); ++i) {
        TLoss single = loss;
        if (loss.fClasses.size() > 1) {
            single.fObjects = {loss.fObjects[i]};
        }
        if (i > 0) {
            single.fLog.clear(); // the server's lines stand with the first
        }
        document.fChecks.push_back(CheckOf(single, document));
        document.fChecks.back().fSubject = "class " + loss.fClasses[i];
    }
}

void AddConsequences(const TLoss& loss, TDocument& document)
{
    TLoss cause = loss;
    cause.fClasses.clear();
    document.fChecks.push_back(CheckOf(cause, document));
    for (const std::string& name : loss.fClasses) {
        TCheck check;
        check.fSubject = "class " + name;
        check.fText = "missing as a consequence of " + loss.fFile;
        check.fAdvice = "correct that file first";
        document.fChecks.push_back(std::move(check));
    }
}

// A class that fails has a line of its own, also when several fail of one cause.
void AddChecks(const TLoss& loss, TDocument& document)
{
    const bool isOfEachClass = loss.fClasses.size() == 1 || loss.fObjects.size() == loss.fClasses.size();
    if (loss.fIsCause) {
        AddConsequences(loss, document);
    } else if (loss.fIsNote || loss.fClasses.empty() || !isOfEachClass) {
        document.fChecks.push_back(CheckOf(loss, document));
    } else {
        AddClassChecks(loss, document);
    }
}

bool Has(const std::vector<std::string>& names, const std::string& name)
{
    return std::find(names.begin(), names.end(), name) != names.end();
}

bool IsAbout(const TLoss& loss, const TProviderRecord& provider)
{
    return (!loss.fProvider.empty() && loss.fProvider == provider.fName) ||
           std::any_of(provider.fClasses.begin(), provider.fClasses.end(),
                       [&loss](const TClassRecord& each) { return Has(loss.fClasses, each.fName); });
}

// A line for each provider: what it should deliver besides, what it delivers, and how long its slowest class took.
TCheck CheckOf(const TProviderRecord& provider, const TDocument& document)
{
    TCheck check;
    const TFact fact = DescribeVendor(provider);
    check.fSubject = fact.fLabel;
    check.fIsOk = true;
    long total = 0;
    const TClassRecord* slowest = nullptr;
    std::vector<std::string> names;
    for (const TClassRecord& each : provider.fClasses) {
        names.push_back(each.fName);
        total += each.fMilliseconds;
        slowest = !slowest || each.fMilliseconds > slowest->fMilliseconds ? &each : slowest;
    }
    std::vector<std::string> missing;
    for (const TLoss& loss : document.fLosses) {
        if (loss.fIsNote || !IsAbout(loss, provider)) {
            continue;
        }
        check.fIsOk = false;
        std::copy_if(loss.fClasses.begin(), loss.fClasses.end(), std::back_inserter(missing),
                     [&](const std::string& name) { return !Has(names, name) && !Has(missing, name); });
    }
    check.fText = (missing.empty() ? "" : "missing " + JoinNames(missing) + "; ") + fact.fText;
    if (slowest) {
        check.fTook =
            std::to_string(total) + " ms (" + slowest->fName + " " + std::to_string(slowest->fMilliseconds) + " ms)";
    }
    return check;
}

class TDoctorCommand : public ICommand
{
  public:
    const char* GetName() const override { return "doctor"; }
    const char* GetPurpose() const override
    {
        return "Check the tree, the server and every vendor, and say what to do";
    }
    bool LooksAtTree() const override { return true; }
    void Fill(TCollector& from, TDocument& into) const override
    {
        into.fDetail = EDetail::kInstances;
        into.fProviders = from.ReadProviders(into.fDetail);
    }
    void Complete(TDocument& document) const override
    {
        for (const TProviderRecord& provider : document.fProviders) {
            document.fChecks.push_back(CheckOf(provider, document));
        }
        for (const TLoss& loss : document.fLosses) {
            AddChecks(loss, document);
        }
        if (document.fChecks.empty()) {
            document.fChecks.push_back({"tree", true, false, "there is no vendor", "", {}, ""});
        }
    }
};

} // namespace

void AddDoctorCommand(TCommands& commands)
{
    commands.push_back(std::make_shared<TDoctorCommand>());
}

} // namespace vrxhost
