// SPDX-License-Identifier: MIT
#include "tests/pegasus/mof/Describe.h"
#include "tests/pegasus/repository/RepositoryHandler.h"
#include "tests/support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <functional>
#include <thread>

using namespace Pegasus;
using namespace Pegasus::repository;
using mof_test::describe;
using mof_test::utf8;
using repository_test::compileText;
using repository_test::failureOf;

namespace {

const CIMNamespaceName kNamespace("root/test");

const char* const kSchema =
    "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);"
    "Qualifier Abstract : boolean = false, Scope(class), Flavor(EnableOverride, Restricted);"
    "Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride, ToSubclass);"
    "[Abstract] class Base { [Key] string Id; string Caption = \"none\"; };"
    "class Sub : Base { uint8 n[] = {1, 2}; };"
    "class Leaf : Sub { real64 r; };"
    "class Keyless { string s; };"
    "[Association] class Keys { [Key] uint32 u; [Key] boolean b; [Key] Keys ref r; string note; };";

class InstanceTest : public testing::Test
{
  protected:
    InstanceTest() { compileText(repository, "root/test", kSchema); }

    void create(const std::string& instances) { compileText(repository, "root/test", instances); }
    std::string list(const char* className, const InstanceOptions& options) const
    {
        std::string text;
        repository.enumerateInstances(kNamespace, CIMName(className), options, [&text](const CIMInstance& found) {
            text += utf8(found.getPath().toString()) + " " + describe(found) + "\n";
            return true;
        });
        return text;
    }

    test::TemporaryDirectory directory;
    Repository repository{directory.path()};
};

CIMInstance instanceOf(const char* className, const std::vector<std::pair<const char*, CIMValue>>& values)
{
    CIMInstance instance{CIMName(className)};
    for (const auto& [name, value] : values) {
        instance.addProperty(CIMProperty(CIMName(name), value));
    }
    return instance;
}

// Names in capitals for even numbers: look-ups ignore the letter case.
CIMName memberName(int number, bool isCapital)
{
    return CIMName(((isCapital ? "MEMBER" : "Member") + std::to_string(number)).c_str());
}

CIMInstance instanceWith(int memberCount, Uint32 value)
{
    CIMInstance instance{CIMName("Wide")};
    for (int i = 0; i < memberCount; ++i) {
        instance.addProperty(CIMProperty(memberName(i, i % 2 == 0), CIMValue(value)));
    }
    instance.setPath(CIMObjectPath("Wide.Id=\"a\""));
    return instance;
}

// Declares a class of so many members below a base that has every second one, and creates an instance.
void createWide(Repository& repository, int memberCount)
{
    CIMClass above{CIMName("Above"), CIMName("Base")};
    CIMClass wide{CIMName("Wide"), CIMName("Above")};
    for (int i = 0; i < memberCount; ++i) {
        if (i % 2 == 0) {
            above.addProperty(CIMProperty(memberName(i, false), CIMValue(Uint32(1))));
        }
        wide.addProperty(CIMProperty(memberName(i, false), CIMValue(Uint32(2))));
    }
    repository.createClass(kNamespace, above);
    repository.createClass(kNamespace, wide);
    CIMInstance instance = instanceOf("Wide", {{"Id", CIMValue(String("a"))}});
    repository.createInstance(kNamespace, instance);
}

using Clock = std::chrono::steady_clock;

// Runs `work` on a thread of its own. Returns: whether a call of `other` began and ended in the first half of that
// time, apart from its first tenth, in which `work` may still be about to begin.
bool isAnsweredDuring(const std::function<void()>& work, const std::function<void()>& other)
{
    std::atomic<bool> isDone{false};
    std::vector<std::pair<Clock::time_point, Clock::time_point>> calls;
    const Clock::time_point start = Clock::now();
    std::thread worker([&] {
        work();
        isDone = true;
    });
    while (!isDone) {
        const Clock::time_point begin = Clock::now();
        other();
        calls.emplace_back(begin, Clock::now());
    }
    const Clock::duration whole = Clock::now() - start;
    worker.join();
    return std::any_of(calls.begin(), calls.end(), [&](const auto& call) {
        return call.first > start + whole / 10 && call.second < start + whole / 2;
    });
}

} // namespace

TEST_F(InstanceTest, CompletesAnInstanceWithItsClassesDefaultsInFront)
{
    const CIMObjectPath path =
        repository.createInstance(kNamespace, instanceOf("LEAF", {{"ID", CIMValue(String("x"))}}));
    EXPECT_EQ(utf8(path.toString()), "Leaf.Id=\"x\"");
    InstanceOptions options;
    options.includeClassOrigin = true;
    const CIMInstance found = repository.getInstance(kNamespace, CIMObjectPath("leaf.id=\"x\""), options);
    EXPECT_EQ(describe(found), "instance Leaf { ~string Caption@Base=<none>; ~uint8[] n@Sub=<1 2 >; "
                               "~real64 r@Leaf=null; string Id@Base=<x>; }");
    EXPECT_EQ(utf8(found.getPath().toString()), "Leaf.Id=\"x\"");
}

TEST_F(InstanceTest, RefusesWhatDoesNotFitTheClass)
{
    struct Row
    {
        const char* name;
        CIMInstance instance;
        const char* failure;
    };
    const CIMValue text(String("1"));
    const Row rows[] = {
        {"unknownClass", instanceOf("Nope", {}), "5 Nope"},
        {"abstractClass", instanceOf("Base", {{"Id", text}}), "7 abstract class cannot have instances: Base"},
        {"unknownProperty", instanceOf("Sub", {{"Id", text}, {"Nope", text}}), "1 no such property: Nope"},
        {"otherType", instanceOf("Sub", {{"Id", CIMValue(Uint8(1))}}), "1 type mismatch"},
        {"noArray", instanceOf("Sub", {{"Id", text}, {"n", CIMValue(Uint8(1))}}), "1 type mismatch"},
        {"noKeys", instanceOf("Keyless", {}), "1 class has no keys: Keyless"},
        {"nullNumberKey", instanceOf("Keys", {{"b", CIMValue(true)}}), "4 key property u is null"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(failureOf([&] { repository.createInstance(kNamespace, row.instance); }), row.failure) << row.name;
    }
    EXPECT_EQ(list("Base", {}), "");
}

// A null text key counts as empty, as in OpenPegasus.
TEST_F(InstanceTest, KnowsAPathInWhateverSpelling)
{
    create("instance of Keys { u = 16; b = true; r = \"Keys.u=1,b=FALSE\"; }; instance of Sub {};");
    const char* const same[] = {"KEYS.U=16,B=TRUE,R=\"Keys.b=FALSE,u=1\"",
                                "Keys.b=true,u=0x10,r=\"keys.B=false,U=0x1\"",
                                "//host/root/else:Keys.u=16,b=TRUE,r=\"Keys.u=1,b=FALSE\"", "Sub.Id=\"\""};
    for (const char* path : same) {
        EXPECT_NO_THROW(repository.getInstance(kNamespace, CIMObjectPath(path), {})) << path;
    }
    const char* const others[] = {"Keys.u=17,b=TRUE,r=\"Keys.u=1,b=FALSE\"", "Keys.u=16,b=TRUE,r=\"Keys.u=2,b=FALSE\"",
                                  "Keys.u=16,b=TRUE", "Sub.Id=\"x\"", "Leaf.Id=\"\""};
    for (const char* path : others) {
        EXPECT_THAT(failureOf([&] { repository.getInstance(kNamespace, CIMObjectPath(path), {}); }),
                    testing::StartsWith("6 "))
            << path;
    }
    EXPECT_EQ(failureOf([&] {
                  repository.createInstance(kNamespace, instanceOf("sub", {{"ID", CIMValue(String())}}));
              }),
              "11 Sub.Id=\"\"");
}

TEST_F(InstanceTest, EnumeratesSubclassesToo)
{
    create("instance of Leaf { Id = \"a\"; r = 1.5; }; instance of Sub { Id = \"b\"; };");
    Array<CIMName> onlyR;
    onlyR.append(CIMName("R"));
    struct Row
    {
        const char* name;
        const char* className;
        InstanceOptions options; // deepInheritance, includeClassOrigin, propertyList
        const char* expected;
    };
    const Row rows[] = {
        {"shallow",
         "base",
         {false, false, {}},
         "Leaf.Id=\"a\" instance Leaf { string Id=<a>; ~string Caption=<none>; }\n"
         "Sub.Id=\"b\" instance Sub { string Id=<b>; ~string Caption=<none>; }\n"},
        {"deep",
         "Base",
         {true, false, {}},
         "Leaf.Id=\"a\" instance Leaf { ~string Caption=<none>; ~uint8[] n=<1 2 >; string Id=<a>; "
         "real64 r=<1.5000000000000000e+00>; }\n"
         "Sub.Id=\"b\" instance Sub { ~string Caption=<none>; ~uint8[] n=<1 2 >; string Id=<b>; }\n"},
        {"listed",
         "Base",
         {true, false, CIMPropertyList(onlyR)},
         "Leaf.Id=\"a\" instance Leaf { real64 r=<1.5000000000000000e+00>; }\nSub.Id=\"b\" instance Sub { }\n"},
        {"leaf",
         "Leaf",
         {false, true, CIMPropertyList(onlyR)},
         "Leaf.Id=\"a\" instance Leaf { real64 r@Leaf=<1.5000000000000000e+00>; }\n"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(list(row.className, row.options), row.expected) << row.name;
    }
    EXPECT_EQ(failureOf([&] { list("Nope", {}); }), "5 Nope");
}

TEST_F(InstanceTest, EnumeratesMoreThanOneBatchInOrderAndStopsWhenTold)
{
    constexpr Uint32 kCount = 150;
    for (Uint32 i = 0; i < kCount; ++i) {
        repository.createInstance(kNamespace, instanceOf("Sub", {{"Id", CIMValue(String(std::to_string(i).c_str()))}}));
    }
    const std::vector<CIMObjectPath> paths = repository.enumerateInstanceNames(kNamespace, CIMName("Base"));
    ASSERT_EQ(paths.size(), kCount);
    for (Uint32 i = 0; i < kCount; ++i) {
        EXPECT_EQ(utf8(paths[i].toString()), "Sub.Id=\"" + std::to_string(i) + "\"");
    }
    Uint32 seen = 0;
    // The visitor may use the repository: it runs outside the lock.
    repository.enumerateInstances(kNamespace, CIMName("Base"), {}, [&](const CIMInstance& found) {
        repository.deleteInstance(kNamespace, found.getPath());
        return ++seen < 100;
    });
    EXPECT_EQ(seen, 100u);
    EXPECT_EQ(repository.enumerateInstanceNames(kNamespace, CIMName("Sub")).size(), kCount - 100);
}

TEST_F(InstanceTest, ModifiesListedPropertiesButNoKey)
{
    create("instance of Leaf { Id = \"a\"; };");
    CIMInstance change = instanceOf("Leaf", {{"Caption", CIMValue(String("new"))}, {"r", CIMValue(Real64(2))}});
    change.setPath(CIMObjectPath("Leaf.Id=\"a\""));
    Array<CIMName> onlyCaption;
    onlyCaption.append(CIMName("caption"));
    repository.modifyInstance(kNamespace, change, CIMPropertyList(onlyCaption));
    EXPECT_EQ(list("Leaf", {}), "Leaf.Id=\"a\" instance Leaf { string Caption=<new>; ~uint8[] n=<1 2 >; "
                                "~real64 r=null; string Id=<a>; }\n");
    CIMInstance keyChange = instanceOf("Leaf", {{"Id", CIMValue(String("b"))}});
    keyChange.setPath(CIMObjectPath("Leaf.Id=\"a\""));
    EXPECT_EQ(failureOf([&] { repository.modifyInstance(kNamespace, keyChange, CIMPropertyList()); }),
              "4 a key property cannot change");
}

// Few members are looked up one by one, many by an index.
TEST_F(InstanceTest, FindsFewAndManyMembersByTheirNames)
{
    for (const int count : {4, 300}) {
        const test::TemporaryDirectory folder;
        Repository wide(folder.path());
        compileText(wide, "root/test", kSchema);
        createWide(wide, count);
        const CIMConstClass whole = wide.getClass(kNamespace, CIMName("Wide"), {false, true, true, {}});
        ASSERT_EQ(whole.getPropertyCount(), Uint32(count) + 2);
        for (int i = 0; i < count; ++i) {
            const CIMConstProperty property = whole.getProperty(whole.findProperty(memberName(i, true)));
            EXPECT_EQ(utf8(property.getClassOrigin().getString()), i % 2 == 0 ? "Above" : "Wide") << i;
        }
        Array<CIMName> names;
        for (int i = 1; i < count; ++i) {
            names.append(memberName(i, i % 3 == 0));
        }
        wide.modifyInstance(kNamespace, instanceWith(count, 7), CIMPropertyList(names));
        names.prepend(memberName(0, false));
        const CIMInstance found =
            wide.getInstance(kNamespace, CIMObjectPath("Wide.Id=\"a\""), {true, false, CIMPropertyList(names)});
        ASSERT_EQ(found.getPropertyCount(), Uint32(count));
        for (int i = 0; i < count; ++i) {
            EXPECT_EQ(found.getProperty(Uint32(i)).getValue(), CIMValue(Uint32(i == 0 ? 2 : 7))) << i;
        }
        EXPECT_EQ(failureOf([&] { wide.modifyInstance(kNamespace, instanceWith(count + 1, 8), {}); }),
                  "1 no such property: MEMBER" + std::to_string(count));
    }
}

// What takes long with a large object is done while the lock is free.
TEST_F(InstanceTest, LargeObjectsKeepNoOtherRequestWaiting)
{
    constexpr int kMembers = 4000;
    RepositoryLimits limits;
    limits.cachedClassCount = 3; // so that reading the others drops Wide
    Repository wide(directory.path() + "/wide", limits);
    compileText(wide, "root/test", kSchema);
    createWide(wide, kMembers);
    const CIMInstance changed = instanceWith(kMembers, 7);
    const ClassOptions whole{false, true, true, {}};
    struct Row
    {
        const char* name;
        std::function<void()> work;
    };
    const Row rows[] = {
        {"modifyInstance", [&] { wide.modifyInstance(kNamespace, changed, {}); }},
        {"getInstance", [&] { wide.getInstance(kNamespace, changed.getPath(), {}); }},
        {"enumerateInstances", [&] { wide.enumerateInstanceNames(kNamespace, CIMName("Base")); }},
        {"getClass", [&] { wide.getClass(kNamespace, CIMName("Wide"), whole); }},
    };
    for (const Row& row : rows) {
        // A busy machine may let the other thread wait, or the working one begin late.
        int answered = 0;
        for (int missed = 0; answered < 3 && missed < 10;) {
            for (const char* name : {"Keys", "Keyless", "Leaf"}) {
                wide.getClass(kNamespace, CIMName(name), whole);
            }
            const bool isAnswered = isAnsweredDuring(row.work, [&] { wide.hasClass(kNamespace, CIMName("Keys")); });
            ++(isAnswered ? answered : missed);
        }
        EXPECT_EQ(answered, 3) << row.name;
    }
}

// Each reads, changes and writes the whole instance: a change that another thread overwrote would be lost.
TEST_F(InstanceTest, ModificationsAtTheSameTimeAllCount)
{
    constexpr int kThreads = 4;
    createWide(repository, kThreads);
    std::vector<std::thread> threads;
    for (int thread = 0; thread < kThreads; ++thread) {
        threads.emplace_back([&, thread] {
            Array<CIMName> mine;
            mine.append(memberName(thread, false));
            for (Uint32 value = 10; value < 110; ++value) {
                const CIMInstance changed = instanceWith(kThreads, value);
                repository.modifyInstance(kNamespace, changed, CIMPropertyList(mine));
                const CIMInstance found =
                    repository.getInstance(kNamespace, changed.getPath(), {true, false, CIMPropertyList(mine)});
                EXPECT_EQ(found.getProperty(0).getValue(), CIMValue(value));
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}
