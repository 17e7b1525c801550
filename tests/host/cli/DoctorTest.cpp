// SPDX-License-Identifier: MIT
// The doctor's answers to broken trees: one row a tree. What a real server has to say is in tests/e2e.
#include "host/core/TUniqueFd.h"
#include "tests/host/cli/VrxhostProgram.h"

#include <nlohmann/json.hpp>

#include <functional>
#include <regex>

#include <fcntl.h>
#include <sys/file.h>

namespace vrxhost {
namespace {

class Doctor : public VrxhostProgram
{
  protected:
    Doctor() { Lay(); }

    // A tree with the fake plug-in as its own and a vendor.
    void Lay() const
    {
        LayTree();
        fs::copy_file(FAKE_PLUGIN, fRoot / "libpegasus.nsp.so");
        fs::create_directories(fVendor);
        std::ofstream(fVendor / "acme.classes.xml") << "<vrx><class name='Fake_Many'/></vrx>";
        std::ofstream(fVendor / "acme.registration.mof") << "instance of PG_ProviderModule { Location = \"acme\"; };";
        fs::copy_file(PLUGIN_WITHOUT_ENTRY_POINTS, fVendor / "libacme.so"); // any library that loads
        for (const char* path : {"libpegasus.nsp.so", "pegasus/provider", "pegasus/provider/acme"}) {
            SetMode(path, 0755);
        }
        for (const auto& file : fs::directory_iterator(fVendor)) {
            fs::permissions(file, fs::perms(0644));
        }
    }

    // Lines are not folded; the tree is ROOT and every time N.
    TProcessOutcome Ask(const std::string& fault, const std::string& format = "table") const
    {
        auto outcome = Start({"/usr/bin/env", "COLUMNS=1000", VRXHOST, "--root", fRoot, "--set", "fake.fault=" + fault,
                              "--format", format, "doctor"});
        std::string& text = outcome.fOutput;
        for (std::size_t at = 0; (at = text.find(fRoot.string(), at)) != std::string::npos;) {
            text.replace(at, fRoot.string().size(), "ROOT");
        }
        text = std::regex_replace(text, std::regex("[0-9]+ ms"), "N ms");
        return outcome;
    }

    const fs::path fVendor = fRoot / "pegasus/provider/acme";
};

constexpr char kLogs[] = "; logs: ROOT/vrxhost.log and ROOT/pegasus/cimserver.log\n";
constexpr char kDelivered[] = "3 classes, 1 instance, in N ms (Fake_EveryType N ms)\n";
const std::string kHealthy = std::string("Vendor fake  ok: ") + kDelivered;

struct TTreeRow
{
    const char* fName;
    std::function<void(const fs::path& root)> fBreak;
    const char* fFault;
    int fStatus;
    std::string fSubject;
    std::string fText;
    std::string fAdvice;
};

const char* const kStageAgain = "stage the tree again (cmake --install BUILD --prefix ROOT, or install the package "
                                "again), or name another with --root";
const std::string kNotATree = "the root directory ROOT is not a deployed tree: ";

void Write(const fs::path& path, const std::string& text)
{
    std::ofstream(path) << text;
}

const TTreeRow kTrees[] = {
    {"no mark", [](const fs::path& root) { fs::remove(root / "pegasus/tree.conf"); }, "", 2, "tree",
     kNotATree + "it has no readable pegasus/tree.conf", kStageAgain},
    {"a later tree", [](const fs::path& root) { Write(root / "pegasus/tree.conf", "format = 9\n"); }, "", 2, "tree",
     kNotATree + "this program does not know the kind of tree that pegasus/tree.conf names", kStageAgain},
    {"no server", [](const fs::path& root) { fs::remove(root / "pegasus/bin/cimserver"); }, "", 2, "tree",
     kNotATree + "it has no program pegasus/bin/cimserver", kStageAgain},
    {"no schema", [](const fs::path& root) { fs::remove(root / "pegasus/pegSchema"); }, "", 2, "tree",
     kNotATree + "it has no folder pegasus/pegSchema", kStageAgain},
    {"a library that all may write",
     [](const fs::path& root) { fs::permissions(root / "pegasus/provider/acme/libacme.so", fs::perms(0666)); }, "", 2,
     "tree",
     "ROOT/pegasus/provider/acme/libacme.so (owner root, mode 0666) could be changed by another user; what runs as "
     "root must belong to root, and nobody else may write it",
     "give it to root or to yourself (chown), and take the right to write from all others (chmod go-w)"},
    {"an unknown setting", [](const fs::path& root) { Write(root / "vrx.conf", "threads = 1\n"); }, "", 2, "settings",
     "ROOT/vrx.conf:1: there is no setting threads", "correct the line, or the option --set"},
    {"a plug-in that does not load", [](const fs::path& root) { Write(root / "libpegasus.nsp.so", "none"); }, "", 1,
     "plug-in", "the plug-in could not be loaded: ROOT/libpegasus.nsp.so: file too short",
     std::string("install what the loader misses, or stage the tree again; --plugin names another file") + kLogs},
    {"a server that does not start", [](const fs::path&) {}, "throws-status", 1, "server",
     "the namespace could not be opened: The connection to the CIM server failed (status 42)",
     std::string("read the server's log from its end, or run pegasus/bin/cimserver by hand") + kLogs},
    {"a text in place of a library",
     [](const fs::path& root) { Write(root / "pegasus/provider/acme/libacme.so", "no library"); }, "", 3, "vendor acme",
     "vendor acme, ROOT/pegasus/provider/acme/libacme.so: the library cannot be loaded: "
     "ROOT/pegasus/provider/acme/libacme.so: file too short",
     std::string("install what is missing, or build the library again") + kLogs},
    {"a library with a missing symbol",
     [](const fs::path& root) {
         fs::copy_file(UNBOUND_LIBRARY, root / "pegasus/provider/acme/libacme.so",
                       fs::copy_options::overwrite_existing);
     },
     "", 3, "vendor acme",
     "vendor acme, ROOT/pegasus/provider/acme/libacme.so: the library cannot be loaded: the symbol "
     "AcmeMissingFunction is missing",
     std::string("install what is missing, or build the library again") + kLogs},
    {"a library that needs another",
     [](const fs::path& root) {
         fs::copy_file(DEPENDENT_LIBRARY, root / "pegasus/provider/acme/libacme.so",
                       fs::copy_options::overwrite_existing);
     },
     "", 3, "vendor acme",
     "vendor acme, ROOT/pegasus/provider/acme/libacme.so: the library cannot be loaded: the library libneeded.so is "
     "missing",
     std::string("install what is missing, or build the library again") + kLogs},
    {"no library", [](const fs::path& root) { fs::remove(root / "pegasus/provider/acme/libacme.so"); }, "", 3,
     "vendor acme",
     "vendor acme, ROOT/pegasus/provider/acme/acme.registration.mof: the library libacme.so (Location) is in no "
     "vendor's folder",
     std::string("put the library there, or correct Location in the registration file") + kLogs},
    {"no class list", [](const fs::path& root) { fs::remove(root / "pegasus/provider/acme/acme.classes.xml"); }, "", 3,
     "vendor acme",
     "vendor acme, ROOT/pegasus/provider/acme: the folder has no class list (*.classes.xml), so that nothing of it is "
     "shown",
     std::string("add NAME.classes.xml; remove the folder when it is not used") + kLogs},
    {"an invalid class name", [](const fs::path&) {},
     "log:TPEGASUSNamespace::CollectClass failed: the class name \"A-B\" in /r/provider/acme/a.classes.xml is invalid",
     3, "class A-B", "vendor acme, /r/provider/acme/a.classes.xml: the class name \"A-B\" is invalid",
     std::string("correct the name in the class list: letters, digits and underscores") + kLogs},
    {"a plug-in that throws", [](const fs::path&) {}, "throws-standard", 1, "plug-in",
     "the namespace could not be opened: out of luck", std::string("read the host's log from its end") + kLogs},
    {"a class that fails", [](const fs::path&) {}, "class-throws", 3, "class Fake_Broken",
     "instances of Fake_Broken could not be fetched: an exception of type int",
     std::string("see in the server's log why the provider failed") + kLogs},
};

TEST_F(Doctor, EachBrokenTreeHasItsAnswer)
{
    for (const TTreeRow& row : kTrees) {
        SCOPED_TRACE(row.fName);
        if (::geteuid() != 0 && row.fText.find("owner root") != std::string::npos) {
            continue;
        }
        Lay();
        row.fBreak(fRoot);
        const auto outcome = Ask(row.fFault);
        EXPECT_TRUE(HasStatus(outcome, row.fStatus));
        const std::string advice = row.fAdvice + (row.fAdvice.back() == '\n' ? "" : "\n");
        const bool isDelivered = row.fStatus == 3;
        const std::size_t width = std::max<std::size_t>(row.fSubject.size(), isDelivered ? 11 : 7);
        const auto padded = [width](const std::string& label) {
            return label + std::string(width - label.size() + 2, ' ');
        };
        const std::string vendor = row.fSubject == "class Fake_Broken" ? "FAILED: " : "ok: ";
        EXPECT_EQ(outcome.fOutput, (isDelivered ? padded("Vendor fake") + vendor + kDelivered : "") +
                                       padded(row.fSubject) + "FAILED: " + row.fText + "\n" + padded("  to do") +
                                       advice);
    }
}

struct TNoteRow
{
    const char* fLine; // of the plug-in's log
    std::string fAnswer;
};

const TNoteRow kNotes[] = {
    {"TPEGASUSNamespace::CollectClass: the timeout of class Fake_Many in /r/provider/acme/a.classes.xml is not a "
     "number "
     "of seconds up to 4294967: \"4294968\" becomes 704 ms",
     "vendor acme  note: vendor acme, /r/provider/acme/a.classes.xml: the timeout of class Fake_Many is "
     "\"4294968\", which is not a number of seconds up to 4294967, and becomes N ms\n"
     "  to do      write whole seconds, 4294967 at most, in <timeout> or in CLASS[SECONDS]\n"},
    {"Not supported type of property lamp in class Fake_Many: 16, default to string.",
     "vendor acme  note: vendor acme, ROOT/pegasus/provider/acme/acme.classes.xml: an embedded object is shown as "
     "text: "
     "Fake_Many.lamp\n"
     "  to do      nothing, when the text is enough; else declare properties of simple types\n"},
    {"Not supported type of property lamp in class CIM_Base: 16, default to string.", ""},
    {"TOSSpecific::SpawnProcess cimmof -n a -aE /r/provider/acme/a.properties.mof: exit status 0: "
     "/r/provider/acme/a.properties.mof:2:1: warning: works here, fails on OpenPegasus 2.14: a parameter named Ref\n"
     "/r/provider/acme/b.mof:7:5: warning: works here, fails on OpenPegasus 2.14: the word",
     "vendor acme  note: vendor acme, /r/provider/acme/a.properties.mof: line 2, column 1: fails on OpenPegasus 2.14: "
     "a "
     "parameter named Ref\n"
     "  to do      change the text as docs/mof.md says under Portability\n"
     "vendor acme  note: vendor acme, /r/provider/acme/b.mof: line 7, column 5: fails on OpenPegasus 2.14: the word\n"
     "  to do      change the text as docs/mof.md says under Portability\n"},
};

// What may be meant so is a note, with the value and the place; the tree is well all the same.
TEST_F(Doctor, NotesNameTheValueAndThePlace)
{
    for (const TNoteRow& row : kNotes) {
        const auto outcome = Ask(std::string("log:") + row.fLine);
        EXPECT_TRUE(HasStatus(outcome, 0));
        EXPECT_EQ(outcome.fOutput, kHealthy + row.fAnswer);
        EXPECT_EQ(outcome.fErrorOutput.empty(), row.fAnswer.empty());
    }
    EXPECT_EQ(nlohmann::json::parse(Ask(std::string("log:") + kNotes[0].fLine, "json").fOutput)["checks"][1]["note"],
              true);
}

TEST_F(Doctor, HealthyTreeIsOneLineAVendor)
{
    const auto outcome = Ask("");
    EXPECT_TRUE(HasStatus(outcome, 0));
    EXPECT_EQ(outcome.fOutput, kHealthy);
    EXPECT_EQ(outcome.fErrorOutput, "");
    const auto json = nlohmann::json::parse(Ask("class-throws", "json").fOutput);
    EXPECT_EQ(json["checks"][0]["ok"], false);
    EXPECT_EQ(json["checks"][1]["subject"], "class Fake_Broken");
    const NKOLVRX20::TUniqueFd root(::open(fRoot.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    ASSERT_EQ(::flock(root.Get(), LOCK_EX | LOCK_NB), 0);
    EXPECT_EQ(Ask("").fOutput, "tree     FAILED: another vrxhost is at work in ROOT\n"
                               "  to do  wait until it has ended, or work in another root (--root, --state)\n");
}

} // namespace
} // namespace vrxhost
