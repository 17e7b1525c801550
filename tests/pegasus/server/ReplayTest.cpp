// SPDX-License-Identifier: MIT
// Recorded requests against our server: the answer must be canonically equal to
// the recorded one, but for the rows that say why ours is better. The
// recordings lie outside the project: VRX_VECTORS_DIR names their folder.
#include "pegasus/base/AsciiCase.h"
#include "tests/pegasus/server/ReplayFixture.h"

#include <algorithm>
#include <filesystem>
#include <map>

namespace servertest {
namespace {

using Exchanges = std::vector<const RecordedExchange*>;

bool isOneOf(const std::string& text, std::initializer_list<const char*> words)
{
    return std::any_of(words.begin(), words.end(), [&text](const char* word) { return text == word; });
}

// A request that a client sent by itself, about something that vendors and
// their hosts made.
bool isClients(const RecordedExchange& recorded)
{
    return !recorded.isRaw && recorded.session.empty() && !isServersOwn(recorded.nameSpace);
}

bool isWrite(const RecordedExchange& recorded)
{
    return isOneOf(recorded.method, {"SetQualifier", "CreateClass", "CreateInstance"});
}

std::string withoutId(const std::string& request)
{
    const std::size_t at = request.find("MESSAGE ID=\"");
    return at == std::string::npos ? request : request.substr(request.find('"', at + 12));
}

// The messages of one compilation in the order of recording. Some were not
// recorded: where the numbers have a gap, writes that other recordings show are
// sent as soon as the server takes them.
class Compilation
{
  public:
    Compilation(Exchanges messages, const Exchanges& others) : fMessages(std::move(messages))
    {
        std::sort(fMessages.begin(), fMessages.end(),
                  [](const auto* x, const auto* y) { return x->message < y->message; });
        std::set<std::string> own;
        for (const RecordedExchange* each : fMessages) {
            own.insert(withoutId(each->request));
        }
        for (const RecordedExchange* each : others) {
            if (isWrite(*each) && own.insert(withoutId(each->request)).second) {
                fMissing.push_back(each);
            }
        }
    }

    // One that finds everything there was recorded after the first.
    bool isRepeated() const { return fMessages.front()->status() != 0; }
    const std::string& nameSpace() const { return fMessages.front()->nameSpace; }

    template <typename Expect, typename Send> void run(const Expect& expect, const Send& fillGap) const
    {
        Exchanges missing = fMissing;
        int last = 0;
        for (const RecordedExchange* each : fMessages) {
            if (each->message > last + 1) {
                missing.erase(std::remove_if(missing.begin(), missing.end(), fillGap), missing.end());
            }
            last = each->message;
            expect(*each);
        }
    }

  private:
    Exchanges fMessages;
    Exchanges fMissing;
};

class ReplayTest : public ReplayFixture
{
  protected:
    // Classes that the namespace's answers show and no recording creates.
    void createUnrecordedClasses(const std::string& nameSpace)
    {
        std::set<std::string> created;
        for (const RecordedExchange& each : recordings()) {
            if (each.method == "CreateClass" && each.nameSpace == nameSpace) {
                created.insert(firstMatch(each.request, "<CLASS NAME=\"(\\w+)\""));
            }
        }
        for (const RecordedExchange& each : recordings()) {
            if (each.method == "GetClass" && each.nameSpace == nameSpace && created.count(each.className) == 0) {
                for (const std::string& text : elementsOf(each.answer.body, "CLASS")) {
                    if (createClass(nameSpace, text)) {
                        created.insert(each.className);
                    }
                }
            }
        }
    }
};

TEST_F(ReplayTest, compilations)
{
    std::map<std::string, Exchanges> sessions;
    Exchanges all;
    for (const RecordedExchange& each : recordings()) {
        if (!each.session.empty() && !isServersOwn(each.nameSpace)) {
            sessions[each.session].push_back(&each);
            all.push_back(&each);
        }
    }
    std::vector<Compilation> compilations;
    for (const auto& [description, messages] : sessions) {
        compilations.emplace_back(messages, all);
    }
    std::stable_sort(compilations.begin(), compilations.end(),
                     [](const auto& x, const auto& y) { return !x.isRepeated() && y.isRepeated(); });
    for (const Compilation& each : compilations) {
        each.run([this](const RecordedExchange& message) { expectRecorded(message); },
                 [&](const RecordedExchange* missing) {
                     if (!each.isRepeated()) {
                         createUnrecordedClasses(each.nameSpace());
                     }
                     return replay(*missing).trailers.count("cimstatuscode") == 0;
                 });
    }
}

TEST_F(ReplayTest, schema)
{
    createRecordedSchema();
    Exchanges reads;
    Exchanges writes;
    Exchanges deletions;
    for (const RecordedExchange& each : recordings()) {
        if (!isClients(each)) {
            continue;
        }
        const bool isOfClasses = isOneOf(each.method, {"GetClass", "EnumerateClasses", "EnumerateClassNames",
                                                       "GetQualifier", "EnumerateQualifiers", "ExecQuery"});
        const bool isOfNothing = !isOfClasses && !isWrite(each) && !isOfProviders(each) &&
                                 elementsOf(each.answer.body, "INSTANCE").empty() &&
                                 elementsOf(each.answer.body, "RETURNVALUE").empty();
        if (each.method == "DeleteInstance") {
            if (!isOfProviders(each)) {
                deletions.push_back(&each);
            }
        } else if (each.method.rfind("Delete", 0) == 0) {
            skip(each, "this server keeps classes and qualifier declarations until its end");
        } else if (isOfClasses && !each.hasFailed() && !each.className.empty() &&
                   !isCreated(each.nameSpace, each.className))
        {
            skip(each, "a superclass of the class is not recorded");
        } else if (isOfClasses || isOfNothing) {
            reads.push_back(&each);
        } else if (isWrite(each)) {
            writes.push_back(&each);
        }
    }
    // What fails because something is there already comes after what made it.
    std::stable_sort(writes.begin(), writes.end(),
                     [](const auto* x, const auto* y) { return !x->hasFailed() && y->hasFailed(); });
    for (const Exchanges* group : {&reads, &writes, &deletions}) {
        for (const RecordedExchange* each : *group) {
            expectRecorded(*each);
        }
    }
}

// Instances that the server keeps itself.
TEST_F(ReplayTest, storedInstances)
{
    createRecordedSchema();
    for (const RecordedExchange& each : recordings()) {
        if (isClients(each) && each.method == "EnumerateInstances" && !isOfProviders(each) &&
            isCreated(each.nameSpace, each.className) && !elementsOf(each.answer.body, "INSTANCE").empty())
        {
            createInstances(each);
            expectRecorded(each, Order::kSorted);
        }
    }
}

// What the server answers of itself: namespaces, registrations, configuration,
// its own end.
TEST_F(ReplayTest, ownClasses)
{
    fTree.compileBase();
    Exchanges last;
    for (const RecordedExchange& each : recordings()) {
        if (each.isRaw || !isServersOwn(each.nameSpace)) {
            continue;
        }
        if (each.className == "__Namespace") {
            for (const std::string& instance : elementsOf(each.answer.body, "INSTANCE")) {
                createNamespace(each.nameSpace + "/" + firstMatch(instance, "<VALUE>([^<]*)"));
            }
            expectRecorded(each, Order::kSorted);
        } else if (each.method == "CreateInstance") {
            for (const RecordedExchange& source : recordings()) {
                const bool shows = source.method == "EnumerateInstances" && source.nameSpace == each.nameSpace &&
                                   each.request.find("CLASSNAME=\"" + source.className + "\"") != std::string::npos;
                if (shows && each.status() == 11) {
                    createInstances(source);
                }
            }
            expectRecorded(each);
        } else if (isOneOf(each.method, {"GetClass", "EnumerateInstances"}) && !each.hasFailed()) {
            skip(each, "shows another version of the base schema, or the recorded "
                       "server's registrations");
        } else if (each.method == "shutdown") {
            last.push_back(&each);
        } else {
            const std::string folder = firstMatch(each.request, "<VALUE>(provider/\\w+):");
            if (!folder.empty()) {
                std::filesystem::create_directories(fTree.home() + "/" + folder);
            }
            expectRecorded(each);
        }
    }
    for (const RecordedExchange* each : last) {
        expectRecorded(*each);
    }
}

TEST_F(ReplayTest, protocol)
{
    createRecordedSchema();
    for (const RecordedExchange& each : recordings()) {
        if (each.isRaw && each.note.find("half close") != std::string::npos) {
            skip(each, "half-closed at once, it is refused by the check of the peer");
        } else if (each.isRaw) {
            expectRecorded(each);
        }
    }
}

} // namespace
} // namespace servertest
