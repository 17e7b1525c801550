// SPDX-License-Identifier: MIT
#include "tests/pegasus/mof/Describe.h"
#include "tests/pegasus/repository/RepositoryHandler.h"
#include "tests/support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <thread>

using namespace Pegasus;
using namespace Pegasus::repository;
using mof_test::describe;
using mof_test::utf8;
using repository_test::compileText;
using repository_test::failureOf;
using repository_test::parseClass;

namespace {

const CIMNamespaceName kNamespace("root/test");

const char* const kQualifiers =
    "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);"
    "Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride, ToSubclass);"
    "Qualifier Abstract : boolean = false, Scope(class, association), Flavor(EnableOverride, Restricted);"
    "Qualifier Override : string = null, Scope(property, method), Flavor(EnableOverride, Restricted);"
    "Qualifier Write : boolean = false, Scope(property), Flavor(DisableOverride, ToSubclass);"
    "Qualifier D : string = null, Scope(any), Flavor(EnableOverride, ToSubclass);";

// A base, a class that overrides, and one below that adds.
const char* const kClasses = "[Abstract, D(\"base\")] class Base {\n"
                             "  [Key, D(\"id\")] string Id; [Write, D(\"c\")] string Caption = \"none\";\n"
                             "  [D(\"m\")] uint32 M([D(\"p\")] string p, uint8 q); boolean N(); };\n"
                             "class Middle : Base { uint8 Own = 1;\n"
                             "  [Override(\"Caption\"), D(\"c2\")] string caption = \"two\";\n"
                             "  [Override(\"M\")] uint32 M(string p, [D(\"q2\")] uint8 q); };\n"
                             "[D(\"leaf\")] class Leaf : Middle { uint8 Extra; };\n";

class ClassTest : public testing::Test
{
  protected:
    ClassTest() { compileText(repository, "root/test", std::string(kQualifiers) + kClasses); }

    std::string read(const char* name, const ClassOptions& options) const
    {
        return describe(repository.getClass(kNamespace, CIMName(name), options));
    }

    test::TemporaryDirectory directory;
    Repository repository{directory.path() + "/a/b"};
};

} // namespace

TEST_F(ClassTest, GivesBackWhatTheOptionsAskFor)
{
    const char* const kMiddleWhole =
        "[~D=<base>:OVERRIDABLE TOSUBCLASS] class Middle : Base { "
        "~[Key=<TRUE>:TOSUBCLASS DISABLEOVERRIDE, D=<id>:OVERRIDABLE TOSUBCLASS] string Id=null; uint8 Own=<1>; "
        "[~Write=<TRUE>:TOSUBCLASS DISABLEOVERRIDE, Override=<Caption>:OVERRIDABLE RESTRICTED, "
        "D=<c2>:OVERRIDABLE TOSUBCLASS] string caption=<two>; ~boolean N(); "
        "[~D=<m>:OVERRIDABLE TOSUBCLASS, Override=<M>:OVERRIDABLE RESTRICTED] uint32 M("
        "[~D=<p>:OVERRIDABLE TOSUBCLASS] string p, [D=<q2>:OVERRIDABLE TOSUBCLASS] uint8 q); }";
    const char* const kMiddleLocal =
        "class Middle : Base { uint8 Own=<1>; [Override=<Caption>:OVERRIDABLE RESTRICTED, "
        "D=<c2>:OVERRIDABLE TOSUBCLASS] string caption=<two>; [Override=<M>:OVERRIDABLE RESTRICTED] uint32 M("
        "string p, [D=<q2>:OVERRIDABLE TOSUBCLASS] uint8 q); }";
    struct Row
    {
        const char* name;
        const char* className;
        ClassOptions options; // localOnly, includeQualifiers, includeClassOrigin, propertyList
        std::string expected;
    };
    Array<CIMName> list;
    list.append(CIMName("CAPTION"));
    list.append(CIMName("Nope"));
    const Row rows[] = {
        {"whole", "middle", {false, true, false, {}}, kMiddleWhole},
        {"local", "Middle", {true, true, false, {}}, kMiddleLocal},
        {"bare",
         "Leaf",
         {false, false, false, {}},
         "class Leaf : Middle { ~string Id=null; ~uint8 Own=<1>; ~string caption=<two>; uint8 Extra=null; "
         "~boolean N(); ~uint32 M(string p, uint8 q); }"},
        {"origins",
         "Leaf",
         {false, false, true, {}},
         "class Leaf : Middle { ~string Id@Base=null; ~uint8 Own@Middle=<1>; ~string caption@Base=<two>; "
         "uint8 Extra@Leaf=null; ~boolean N@Base(); ~uint32 M@Base(string p, uint8 q); }"},
        {"listed",
         "Leaf",
         {false, false, false, CIMPropertyList(list)},
         "class Leaf : Middle { ~string caption=<two>; ~boolean N(); ~uint32 M(string p, uint8 q); }"},
        {"listedNone",
         "Base",
         {false, false, false, CIMPropertyList(Array<CIMName>())},
         "class Base { uint32 M(string p, uint8 q); boolean N(); }"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(read(row.className, row.options), row.expected) << row.name;
    }
    // The second answer comes from the cache.
    EXPECT_EQ(read("MIDDLE", {false, true, false, {}}), kMiddleWhole);
}

TEST_F(ClassTest, RefusesWhatBreaksARuleAndStoresNothingOfIt)
{
    struct Row
    {
        const char* name;
        const char* definition; // of class X
        const char* failure;
    };
    const Row rows[] = {
        {"exists", "class LEAF {};", "11 LEAF"},
        {"noSuperclass", "class X : Nope {};", "10 Nope"},
        {"itself", "class X : X {};", "10 X"},
        {"undeclared", "class X { [Gone] string p; };", "1 undeclared qualifier: Gone"},
        {"otherType", "class X { [Retyped(\"a\")] string p; };", "1 bad qualifier type: Retyped"},
        {"scopeClass", "[Key] class X {};", "1 qualifier invalid in this scope: Key scope=CLASS"},
        {"scopeMethod", "class X { [Key] uint32 m(); };", "1 qualifier invalid in this scope: Key scope=METHOD"},
        {"scopeParameter", "class X { uint32 m([Write] string p); };",
         "1 qualifier invalid in this scope: Write scope=PARAMETER"},
        {"scopeReference", "[Association] class X { [Write] Base ref r; };",
         "1 qualifier invalid in this scope: Write scope=REFERENCE"},
        {"reference", "class X { Base ref r; };", "4 Non-association class contains reference property"},
        {"overriddenType", "class X : Base { uint8 caption; };", "1 type mismatch"},
        {"overriddenArray", "class X : Base { string caption[]; };", "1 type mismatch"},
        {"overriddenMethod", "class X : Base { string M(); };", "1 type mismatch"},
        {"overriddenKey", "class X : Base { [Key(false)] string Id; };", "1 qualifier cannot be overridden: Key"},
        {"keyArray", "class X { [Key] string k[]; };", "4 key property k is an array"},
    };
    compileText(repository, "root/test", "Qualifier Retyped : boolean, Scope(any);");
    const std::string declarations =
        std::string(kQualifiers) + "Qualifier Gone : boolean, Scope(any); Qualifier Retyped : string, Scope(any);";
    for (const Row& row : rows) {
        const CIMClass newClass = parseClass(declarations, row.definition);
        EXPECT_EQ(failureOf([&] { repository.createClass(kNamespace, newClass); }), row.failure) << row.name;
        EXPECT_FALSE(repository.hasClass(kNamespace, CIMName("X"))) << row.name;
    }
}

TEST_F(ClassTest, LetsTheRulesAllowWhatOpenPegasusAllows)
{
    const char* const definitions[] = {
        "class X1 : Base { [Key] string SecondKey; };",
        "class X2 : Base { [Key, D(\"again\")] string id; };",
        "[Association] class X3 { [Key] NotYet ref r; };",
        "class X4 : X3 { Base ref another; };",
        "[Abstract, Association] class X5 {};",
    };
    for (const char* definition : definitions) {
        EXPECT_NO_THROW(compileText(repository, "root/test", definition)) << definition;
    }
}

TEST_F(ClassTest, LetsAUseNarrowItsFlavorButNotWidenIt)
{
    compileText(repository, "root/test",
                "class X { [D(\"a\") : Restricted] string a; [D(\"b\") : DisableOverride] string b; "
                "[Key(false) : EnableOverride] string k; };");
    EXPECT_EQ(read("X", {true, true, false, {}}), "class X { [D=<a>:OVERRIDABLE RESTRICTED] string a=null; "
                                                  "[D=<b>:TOSUBCLASS DISABLEOVERRIDE] string b=null; "
                                                  "[Key=<FALSE>:TOSUBCLASS DISABLEOVERRIDE] string k=null; }");
}

TEST_F(ClassTest, ListsSubclassesInOrderOfCreation)
{
    compileText(repository, "root/test", "class Other : base {}; class Alone {};");
    const auto list = [this](const CIMName& name, bool isDeep) {
        std::string text;
        for (const CIMName& found : repository.enumerateClassNames(kNamespace, name, isDeep)) {
            text += utf8(found.getString()) + " ";
        }
        return text;
    };
    EXPECT_EQ(list(CIMName(), false), "Base Alone ");
    EXPECT_EQ(list(CIMName(), true), "Base Middle Leaf Other Alone ");
    EXPECT_EQ(list(CIMName("BASE"), false), "Middle Other ");
    EXPECT_EQ(list(CIMName("base"), true), "Middle Leaf Other ");
    EXPECT_EQ(list(CIMName("Leaf"), true), "");
    EXPECT_EQ(failureOf([&] { list(CIMName("Nope"), true); }), "5 Nope");
}

// Classes are checked while the lock is free: each must be stored once, and the others' threads see it whole.
TEST_F(ClassTest, CreationsOfOneClassAtTheSameTimeStoreItOnce)
{
    constexpr int kThreads = 4;
    constexpr int kClassCount = 100;
    std::vector<CIMClass> classes;
    for (int i = 0; i < kClassCount; ++i) {
        classes.push_back(parseClass(kQualifiers, ("[D(\"x\")] class C" + std::to_string(i) +
                                                   " { [Key, D(\"id\")] string Id; [D(\"p\")] uint8 P = 7; };")
                                                      .c_str()));
    }
    std::atomic<int> created{0};
    std::atomic<int> refused{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t) {
        threads.emplace_back([&] {
            for (const CIMClass& one : classes) {
                const std::string failure = failureOf([&] { repository.createClass(kNamespace, one.clone()); });
                created += failure == "no failure";
                refused += failure == "11 " + utf8(one.getClassName().getString());
                const CIMConstClass seen = repository.getClass(kNamespace, one.getClassName(), {});
                EXPECT_EQ(seen.getPropertyCount(), 2u);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(created, kClassCount);
    EXPECT_EQ(refused, kClassCount * (kThreads - 1));
}

TEST_F(ClassTest, AnswersTheSameWithRoomForOneClassOnly)
{
    RepositoryLimits tiny;
    tiny.cachedClassCount = 1;
    Repository cramped(directory.path() + "/tiny", tiny);
    compileText(cramped, "root/test", std::string(kQualifiers) + kClasses);
    for (const char* name : {"Leaf", "Base", "Middle", "Leaf"}) {
        const ClassOptions whole{false, true, true, {}};
        EXPECT_EQ(describe(cramped.getClass(kNamespace, CIMName(name), whole)), read(name, whole)) << name;
    }
}

TEST_F(ClassTest, KeepsTheTypeOfAQualifierDeclaration)
{
    compileText(repository, "root/test", "Qualifier D : uint8 = 1, Scope(class);");
    EXPECT_EQ(describe(repository.getQualifier(kNamespace, CIMName("d"))),
              "qualifier D string=null scope(CLASS ASSOCIATION INDICATION PROPERTY REFERENCE METHOD PARAMETER) "
              "flavor(OVERRIDABLE TOSUBCLASS)");
    compileText(repository, "root/test", "Qualifier D : string = \"new\", Scope(class);");
    EXPECT_EQ(describe(repository.getQualifier(kNamespace, CIMName("D"))),
              "qualifier D string=<new> scope(CLASS) flavor(OVERRIDABLE TOSUBCLASS)");
    EXPECT_EQ(repository.enumerateQualifiers(kNamespace).size(), 6u);
    EXPECT_EQ(failureOf([&] { repository.getQualifier(kNamespace, CIMName("Nope")); }), "6 Nope");
}

TEST_F(ClassTest, KeepsNamespacesApart)
{
    EXPECT_EQ(failureOf([&] { repository.createNamespace(CIMNamespaceName("ROOT/Test")); }), "11 ROOT/Test");
    repository.createNamespace(CIMNamespaceName("a/b/c"));
    EXPECT_FALSE(repository.hasClass(CIMNamespaceName("a/b/c"), CIMName("Base")));
    EXPECT_EQ(failureOf([&] { repository.hasClass(CIMNamespaceName("root/none"), CIMName("Base")); }), "3 root/none");
    std::string names;
    for (const CIMNamespaceName& name : repository.namespaces()) {
        names += utf8(name.getString()) + " ";
    }
    EXPECT_EQ(names, "root root/test a/b/c ");
    EXPECT_TRUE(repository.hasNamespace(CIMNamespaceName("A/B/C")));
}

TEST(LimitsOfARepository, AreNamedWhereTheyAreExceeded)
{
    const test::TemporaryDirectory directory;
    RepositoryLimits tight;
    tight.objectBytes = 2000;
    tight.inheritanceDepth = 3;
    tight.namespaceCount = 2;
    tight.cachedClassCount = 1; // depths are counted from the file
    Repository repository(directory.path(), tight);
    compileText(repository, "root/test", "class A {}; class B : A {}; class C : B {};");
    EXPECT_THAT(failureOf([&] { repository.createNamespace(CIMNamespaceName("x")); }),
                testing::StartsWith("27 more namespaces than the limit namespaceCount (2)"));
    EXPECT_THAT(failureOf([&] { repository.createClass(kNamespace, parseClass("", "class D : C {};")); }),
                testing::StartsWith("27 class is deeper than the limit inheritanceDepth (3)"));
    const std::string large = "class L { string s = \"" + std::string(2000, 'x') + "\"; };";
    EXPECT_THAT(failureOf([&] { repository.createClass(kNamespace, parseClass("", large)); }),
                testing::StartsWith("27 object is larger than the limit objectBytes (2000)"));
    EXPECT_FALSE(repository.hasClass(kNamespace, CIMName("L")));
}
