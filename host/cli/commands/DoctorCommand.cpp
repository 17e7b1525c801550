// SPDX-License-Identifier: MIT
// What is wrong with the tree, the server and each vendor, and what to do about it.
#include "host/cli/collect/TCollector.h"
#include "host/cli/commands/ICommand.h"

#include <algorithm>

namespace vrxhost {
namespace {

// The first row whose text a sentence contains decides what the sentence is about, where it names no vendor, and what
// to do.
struct TAdviceRow
{
    const char* fText;
    const char* fSubject;
    const char* fAdvice;
};

const TAdviceRow kAdvice[] = {
    {"is not a deployed tree", "tree",
     "stage the tree again (cmake --install BUILD --prefix ROOT, or install the package again), or name another "
     "with --root"},
    {"could be changed by another user", "tree",
     "give it to root or to yourself (chown), and take the right to write from all others (chmod go-w)"},
    {"another vrxhost is at work", "tree", "wait until it has ended, or work in another root (--root, --state)"},
    {"can be written", "tree", "name a directory that you may write with --state"},
    {"state directory", "tree", "name a directory of your own, or one that is empty, with --state"},
    {"root directory", "tree", "name a deployed tree with --root"},
    {"there is no setting", "settings", "correct the line, or the option --set"},
    {"it can be:", "settings", "correct the line, or the option --set"},
    {"plug-in could not be loaded", "plug-in",
     "install what the loader misses, or stage the tree again; --plugin names another file"},
    {"is not a namespace-provider plug-in", "plug-in", "stage the tree again; --plugin names another file"},
    {"the plug-in", "plug-in", "read the host's log from its end"},
    {"the server did not start", "server", "read the server's log from its end, or run pegasus/bin/cimserver by hand"},
    {"has no server of its own", "server", "read the server's log from its end, or run pegasus/bin/cimserver by hand"},
    {"connection to the CIM server failed", "server",
     "read the server's log from its end, or run pegasus/bin/cimserver by hand"},
    {"could not be set, cimconfig", "server", "stage the tree again: pegasus/bin/cimconfig does not work"},
    {"did not compile", "schema", "correct the file at that line and column; docs/mof.md describes the language"},
    {"is invalid", "vendors", "correct the name in the class list: letters, digits and underscores"},
    {"cannot be loaded", "vendors", "install what is missing, or build the library again"},
    {"is in no vendor's folder", "vendors", "put the library there, or correct Location in the registration file"},
    {"no registration file", "vendors",
     "add NAME.registration.mof with PG_ProviderModule, PG_Provider and PG_ProviderCapabilities; docs/vendors.md has "
     "an example"},
    {"no PG_ProviderCapabilities instance", "vendors",
     "add an instance of PG_ProviderCapabilities with this ClassName to the registration file"},
    {"asked for in namespace", "vendors",
     "make <nsp> of the class list and Namespaces of the registration file the same"},
    {"has no class list", "vendors", "add NAME.classes.xml; remove the folder when it is not used"},
    {"is not declared, so that", "vendors", "declare the property in the class's MOF, or leave it unset"},
    {"declared with another type", "vendors", "use the same type in the class's MOF and in the provider"},
    {"class list", "vendors", "correct the class list at that line"},
    {"could not be fetched", "vendors",
     "declare the class in a *.properties.mof of the folder, correct its name in the class list, or see why the "
     "provider failed"},
    {"instance", "vendors", "see in the server's log why the provider failed"},
};

constexpr TAdviceRow kNoAdvice = {"", "run", ""};

const TAdviceRow& AdviceOn(const std::string& sentence)
{
    const auto found = std::find_if(std::begin(kAdvice), std::end(kAdvice), [&sentence](const TAdviceRow& row) {
        return sentence.find(row.fText) != std::string::npos;
    });
    return found == std::end(kAdvice) ? kNoAdvice : *found;
}

std::string LogFiles(const TDocument& document)
{
    const std::string server = document.fRoot.empty() ? "" : document.fRoot + "/pegasus/cimserver.log";
    return document.fLogFile + (document.fLogFile.empty() || server.empty() ? "" : " and ") + server;
}

TCheck CheckOf(const TLoss& loss, const TDocument& document)
{
    const std::string sentence = loss.GetText();
    const TAdviceRow& row = AdviceOn(sentence);
    TCheck check;
    check.fSubject = loss.fVendor.empty() ? row.fSubject : "vendor " + loss.fVendor;
    check.fText = sentence;
    check.fAdvice = row.fAdvice;
    check.fLog = loss.fLog;
    const std::string logs = LogFiles(document);
    if (!logs.empty()) {
        check.fAdvice += (check.fAdvice.empty() ? "read " : "; logs: ") + logs;
    }
    return check;
}

// A line for each provider: what it delivers, and how long its slowest class took.
TCheck CheckOf(const TProviderRecord& provider, const TDocument& document)
{
    TCheck check;
    const TFact fact = DescribeVendor(provider);
    check.fSubject = fact.fLabel;
    check.fText = fact.fText;
    long total = 0;
    const TClassRecord* slowest = nullptr;
    check.fIsOk = true;
    for (const TClassRecord& each : provider.fClasses) {
        total += each.fMilliseconds;
        slowest = !slowest || each.fMilliseconds > slowest->fMilliseconds ? &each : slowest;
        for (const TLoss& loss : document.fLosses) {
            const bool isAbout =
                std::find(loss.fClasses.begin(), loss.fClasses.end(), each.fName) != loss.fClasses.end();
            check.fIsOk &= loss.fIsNote || !isAbout;
        }
    }
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
            if (!loss.fIsNote) {
                document.fChecks.push_back(CheckOf(loss, document));
            }
        }
        if (document.fChecks.empty()) {
            document.fChecks.push_back({"tree", true, "there is no vendor", "", {}, ""});
        }
    }
};

} // namespace

void AddDoctorCommand(TCommands& commands)
{
    commands.push_back(std::make_shared<TDoctorCommand>());
}

} // namespace vrxhost
