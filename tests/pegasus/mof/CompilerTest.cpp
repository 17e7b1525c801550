// SPDX-License-Identifier: MIT
#include "pegasus/mof/Compiler.h"

#include "pegasus/mof/MemoryHandler.h"
#include "tests/pegasus/mof/Describe.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>

using namespace Pegasus;
using namespace Pegasus::mof;
using mof_test::describe;
using mof_test::utf8;

namespace {

// Declarations that every case can use; on one line, so that a case's own lines start at 2.
const std::string kQualifiers =
    "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);"
    "Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride, ToSubclass);"
    "Qualifier Experimental : boolean = false, Scope(any), Flavor(EnableOverride, Restricted);"
    "Qualifier Version : string = null, Scope(class), Flavor(EnableOverride, Restricted, Translatable);"
    "Qualifier Description : string = null, Scope(any), Flavor(EnableOverride, ToSubclass, Translatable);"
    "Qualifier MaxLen : uint32 = null, Scope(property);"
    "Qualifier Values : string[], Scope(property);\n";

CompileOptions options()
{
    CompileOptions result;
    result.nameSpace = CIMNamespaceName("root/test");
    return result;
}

MemoryHandler compile(const std::string& text, const CompileOptions& with = options())
{
    MemoryHandler handler;
    compileText(kQualifiers + text, "t.mof", with, handler);
    return handler;
}

// Writes down its calls, and finds one that begins while another runs.
class Recorder : public MemoryHandler
{
  public:
    void declareQualifier(const CIMQualifierDecl& declaration) override
    {
        const Call call(*this, "declare " + utf8(declaration.getName().getString()));
        MemoryHandler::declareQualifier(declaration);
    }
    bool createClass(const CIMClass& newClass) override
    {
        const Call call(*this, utf8(newClass.getClassName().getString()));
        return MemoryHandler::createClass(newClass);
    }
    bool createInstance(const CIMInstance& newInstance) override
    {
        const Call call(*this, "instance of " + utf8(newInstance.getClassName().getString()));
        return MemoryHandler::createInstance(newInstance);
    }
    void warn(const std::string& place, const std::string& text) override
    {
        const Call call(*this, "warn " + place);
        MemoryHandler::warn(place, text);
    }

    std::string calls; // each with a semicolon

  private:
    struct Call
    {
        Call(Recorder& owner, const std::string& text) : running(owner.fRunning)
        {
            EXPECT_EQ(running.fetch_add(1), 0) << text;
            owner.calls += text + ";";
        }
        ~Call() { --running; }
        std::atomic<int>& running;
    };
    std::atomic<int> fRunning{0};
};

// Returns: the error as "line:column: cause"; empty on success.
std::string failureOf(const std::string& text, const CompileOptions& with = options())
{
    try {
        compile(text, with);
        return "";
    } catch (const MofError& error) {
        return std::to_string(error.place().line) + ":" + std::to_string(error.place().column) + ": " + error.cause();
    }
}

} // namespace

struct LiteralCase
{
    const char* name;
    const char* declaration; // of the property p with its default
    const char* expected;    // type and value, or the failure
};

void PrintTo(const LiteralCase& row, std::ostream* out)
{
    *out << row.name << ": " << row.declaration;
}

class Literals : public testing::TestWithParam<LiteralCase>
{
};

TEST_P(Literals, AreReadAsTheirTypeSays)
{
    const std::string text = "class C {\n" + std::string(GetParam().declaration) + ";};";
    const std::string failure = failureOf(text);
    if (!failure.empty()) {
        EXPECT_EQ(failure, GetParam().expected);
        return;
    }
    EXPECT_EQ(describe(compile(text).classes().at(0)), "class C { " + std::string(GetParam().expected) + "; }");
}

INSTANTIATE_TEST_SUITE_P(
    All, Literals,
    testing::Values(
        LiteralCase{"decimal", "uint8 p = 255", "uint8 p=<255>"},
        LiteralCase{"negative", "sint8 p = -128", "sint8 p=<-128>"},
        LiteralCase{"plus", "sint16 p = +7", "sint16 p=<7>"},
        LiteralCase{"hex", "uint16 p = 0xFfFf", "uint16 p=<65535>"},
        LiteralCase{"hexEndingInB", "uint16 p = 0x1B", "uint16 p=<27>"},
        LiteralCase{"binary", "uint8 p = 101b", "uint8 p=<5>"}, LiteralCase{"octal", "uint32 p = 017", "uint32 p=<15>"},
        LiteralCase{"zero", "uint32 p = 0", "uint32 p=<0>"},
        LiteralCase{"greatest", "uint64 p = 18446744073709551615", "uint64 p=<18446744073709551615>"},
        LiteralCase{"least", "sint64 p = -9223372036854775808", "sint64 p=<-9223372036854775808>"},
        LiteralCase{"minusZeroUnsigned", "uint8 p = -0", "uint8 p=<0>"},
        LiteralCase{"tooGreat", "uint8 p = 256", "3:11: Invalid uint8 value: 256"},
        LiteralCase{"tooSmall", "sint8 p = -129", "3:11: Invalid sint8 value: -129"},
        LiteralCase{"negativeUnsigned", "uint8 p = -1", "3:11: Invalid uint8 value: -1"},
        LiteralCase{"beyond64Bits", "uint64 p = 18446744073709551616",
                    "3:12: Invalid uint64 value: 18446744073709551616"},
        LiteralCase{"badOctal", "uint8 p = 08", "3:11: Invalid uint8 value: 08"},
        LiteralCase{"badBinary", "uint8 p = 12b", "3:11: Invalid uint8 value: 12b"},
        LiteralCase{"lettersBehind", "uint8 p = 1x", "3:11: Invalid uint8 value: 1x"},
        LiteralCase{"loneSign", "sint8 p = -", "3:11: Invalid sint8 value: -"},
        LiteralCase{"stringForNumber", "uint8 p = \"1\"", "3:11: Invalid uint8 value: a string"},
        LiteralCase{"realForNumber", "uint8 p = 1.0", "3:11: Invalid uint8 value: 1.0"},
        LiteralCase{"real", "real64 p = -1.5e+3", "real64 p=<-1.5000000000000000e+03>"},
        LiteralCase{"realWithoutLead", "real32 p = .5", "real32 p=<5.0000000000000000e-01>"},
        LiteralCase{"integerForReal", "real64 p = -2", "real64 p=<-2.0000000000000000e+00>"},
        LiteralCase{"realBeyondRange", "real32 p = 1.0e39", "3:12: Invalid real32 value: 1.0e39"},
        LiteralCase{"realWithoutFraction", "real64 p = 1.", "3:12: Invalid real64 value: 1."},
        LiteralCase{"true", "boolean p = TRUE", "boolean p=<TRUE>"},
        LiteralCase{"numberForBoolean", "boolean p = 1", "3:13: Invalid boolean value: 1"},
        LiteralCase{"nullOfType", "uint8 p = NULL", "uint8 p=null"},
        LiteralCase{"nullOfArray", "uint8 p[] = null", "uint8[] p=null"},
        LiteralCase{"joined", "string p = \"a\" /* x */\n \"b\" // y\n \"c\"", "string p=<abc>"},
        LiteralCase{"escapes", R"(string p = "\b\t\n\f\r\"\'\\")", "string p=<\b\t\n\f\r\"'\\>"},
        LiteralCase{"hexEscapes", R"(string p = "\x41\x00e9\X540dz")", "string p=<Aé名z>"},
        LiteralCase{"surrogates", R"(string p = "\xD83D\xDE00")", "string p=<😀>"},
        LiteralCase{"utf8", "string p = \"é名😀\"", "string p=<é名😀>"},
        LiteralCase{"unknownEscape", R"(string p = "C:\Program Files\x")", "string p=<C:\\Program Files\\x>"},
        LiteralCase{"escapeAtLineEnd", "string p = \"a\\\n\"", "3:12: string is not closed on its line"},
        LiteralCase{"zeroEscape", R"(string p = "\x0")", "3:13: \\x0 is not a character"},
        LiteralCase{"openString", "string p = \"abc\n\"", "3:12: string is not closed on its line"},
        LiteralCase{"char", "char16 p = 'A'", "char16 p=<A>"},
        LiteralCase{"charEscape", R"(char16 p = '\'')", "char16 p=<'>"},
        LiteralCase{"charUtf8", "char16 p = '名'", "char16 p=<名>"},
        LiteralCase{"charNumber", "char16 p = 65", "char16 p=<A>"},
        LiteralCase{"charString", "char16 p = \"A\"", "char16 p=<A>"},
        LiteralCase{"charStringTwo", "char16 p = \"AB\"", "3:12: Invalid char16 value: a string"},
        LiteralCase{"charUnknownEscape", R"(char16 p = '\q')", "3:13: unknown escape sequence in a character literal"},
        LiteralCase{"charTwo", "char16 p = 'AB'", "3:12: Invalid char16 value: a character"},
        LiteralCase{"charEmpty", "char16 p = ''", "3:12: character literal is empty"},
        LiteralCase{"charOpen", "char16 p = 'A", "3:12: character literal is not closed after one character"},
        LiteralCase{"datetime", "datetime p = \"20200102030405.678901+060\"", "datetime p=<20200102030405.678901+060>"},
        LiteralCase{"interval", "datetime p = \"00000012030405.000006:000\"", "datetime p=<00000012030405.000006:000>"},
        LiteralCase{"datetimeShape", "datetime p = \"yesterday\"",
                    "3:14: Invalid datetime value: yesterday: invalid datetime format"},
        LiteralCase{"array", "uint8 p[] = {1, 0x2, 11b}", "uint8[] p=<1 2 3 >"},
        LiteralCase{"arrayFixed", "string p[2] = {\"a\", \"b\" \"c\"}", "string[2] p=<a bc >"},
        LiteralCase{"arrayWrongCount", "uint8 p[2] = {1}", "3:14: type mismatch: 1 elements for an array of 2"},
        LiteralCase{"arrayElementRange", "uint8 p[] = {1, 256}", "3:17: Invalid uint8 value: 256"},
        LiteralCase{"arrayNullElement", "uint8 p[] = {1, null}", "uint8[] p=<1 0 >"},
        LiteralCase{"arrayEmpty", "uint8 p[] = {}", "3:14: expected a value instead of '}'"},
        LiteralCase{"arraySizeZero", "uint8 p[0]", "3:9: array size must be a positive decimal number"},
        LiteralCase{"arrayForScalar", "uint8 p = {1}", "3:11: type mismatch: a single uint8 value is expected"},
        LiteralCase{"scalarForArray", "uint8 p[] = 1", "3:13: type mismatch: an array of uint8 value is expected"}),
    [](const testing::TestParamInfo<LiteralCase>& row) { return std::string(row.param.name); });

TEST(Compiler, ReadsEveryPartOfAClass)
{
    const MemoryHandler handler =
        compile("class A0 {};\n"
                "[Version(\"1.0.0\"), Description(\"d\") : DisableOverride Restricted] CLASS B : A0 {\n"
                "[key, MaxLen(8), Values{\"x\", \"y\"}] string k; uint16 list[] = {1};\n"
                "uint32 m(); [Description] boolean n([Description(\"p\")] string a[3], C ref r, C REF rs[]); };");
    EXPECT_EQ(describe(handler.classes().at(1)),
              "[Version=<1.0.0>, Description=<d>:TRANSLATABLE DISABLEOVERRIDE RESTRICTED] class B : A0 { "
              "[key=<TRUE>, MaxLen=<8>, Values=<x y >] string k=null; uint16[] list=<1 >; uint32 m(); "
              "[Description=null] boolean n([Description=<p>] string[3] a, C ref r, C ref[] rs); }");
}

TEST(Compiler, ReadsQualifierDeclarations)
{
    struct Row
    {
        const char* name;
        const char* text;
        const char* expected;
    };
    const Row rows[] = {
        {"flavors", "qualifier Q : boolean = false, scope(class, parameter), flavor(disableoverride, restricted);",
         "qualifier Q boolean=<FALSE> scope(CLASS PARAMETER) flavor(DISABLEOVERRIDE RESTRICTED)"},
        {"defaults", "Qualifier Q : string[2] = {\"a\", \"b\"}, Scope(any);",
         "qualifier Q string[2]=<a b > scope(CLASS ASSOCIATION INDICATION PROPERTY REFERENCE METHOD PARAMETER) "
         "flavor(OVERRIDABLE TOSUBCLASS)"},
        {"flavorFirst", "Qualifier Q : uint8, Flavor(ToInstance, Translatable), Scope(reference);",
         "qualifier Q uint8=null scope(REFERENCE) flavor(OVERRIDABLE TOSUBCLASS TOINSTANCE TRANSLATABLE)"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(describe(compile(row.text).qualifiers().at("q")), row.expected) << row.name;
    }
}

TEST(Compiler, GivesInstancesTheTypesOfTheirClass)
{
    const MemoryHandler handler = compile("class A { [Key] string id; uint8 n[]; }; class B : A { real32 r; };\n"
                                          "instance of b as $x { N = {1, 2}; ID = \"one\"; r = null; };");
    EXPECT_EQ(describe(handler.instances().at(0)), "instance B { uint8[] n=<1 2 >; string id=<one>; real32 r=null; }");
}

// Constructs beyond DSP0004 that vendors' files have, because OpenPegasus's compiler accepts them.
TEST(Compiler, AcceptsWhatOpenPegasusAccepts)
{
    struct Row
    {
        const char* name;
        std::string text;
        std::string expected; // of the class X, or its instance
        std::vector<std::string> warnings;
    };
    const std::string schema = "class X { [Key] string id; uint8 n[]; X ref r; }; ";
    const Row rows[] = {
        {"parenthesesForArray",
         "class X { [Values(\"a\")] string p; };",
         "class X { [Values=<a >] string p=null; }",
         {}},
        {"bracesForScalar", "class X { [MaxLen{8}] string p; };", "class X { [MaxLen=<8>] string p=null; }", {}},
        {"unknownEscape",
         "class X { string p = \"C:\\temp \\q\"; };",
         "class X { string p=<C:\temp \\q>; }",
         {"t.mof:2:31: warning: unknown escape sequence \\q: the backslash is part of the string"}},
        {"emptyArray",
         schema + "instance of X { id = \"1\"; n = {}; };",
         "instance X { string id=<1>; uint8[] n=<>; }",
         {}},
        {"nullElement",
         schema + "instance of X { id = \"1\"; n = {2, null}; };",
         "instance X { string id=<1>; uint8[] n=<2 0 >; }",
         {"t.mof:2:85: warning: an array holds no nulls: the element becomes the type's default"}},
        {"propertyTwice",
         schema + "instance of X { id = \"1\"; ID = \"2\"; };",
         "instance X { string id=<2>; }",
         {"t.mof:2:77: warning: property ID is given twice: the last value holds"}},
        {"aliasThenNull",
         schema + "instance of X { id = \"1\"; r = $later; r = null; };",
         "instance X { string id=<1>; X ref r=null; }",
         {"t.mof:2:89: warning: property r is given twice: the last value holds"}},
        {"methodTwice",
         "class X { uint32 m(); string M(uint8 a); };",
         "class X { uint32 m(); }",
         {"t.mof:2:30: warning: Method M already exists in class X"}},
        {"namespacePragma",
         "#pragma namespace (\"root/other\")\nclass X {};",
         "class X { }",
         {"t.mof:2:20: warning: Pragma \"namespace\" not implemented by the compiler. Ignored"}},
        {"openComment",
         "class X {}; /* class Y {};",
         "class X { }",
         {"t.mof:2:13: warning: comment is not closed: it takes the rest of the file"}},
    };
    for (const Row& row : rows) {
        const MemoryHandler handler = compile(row.text);
        EXPECT_EQ(handler.instances().empty() ? describe(handler.classes().at(0)) : describe(handler.instances()[0]),
                  row.expected)
            << row.name;
        EXPECT_EQ(handler.warnings(), row.warnings) << row.name;
    }
    EXPECT_EQ(failureOf("class X { [MaxLen{8, 9}] string p; };"),
              "2:18: type mismatch: a single uint32 value is expected");
    EXPECT_EQ(failureOf(schema + "instance of X { id = {}; };"),
              "2:72: type mismatch: a single string value is expected");
}

// Texts that OpenPegasus 2.14's compiler refuses: one warning for each kind, or an error.
TEST(Compiler, ReportsWhatFailsOnOpenPegasus)
{
    struct Row
    {
        std::string text;
        const char* place; // of the first of two
        const char* kind;
    };
    const std::string embedded = "Qualifier EmbeddedInstance : string = null, Scope(property); ";
    const Row rows[] = {
        {"[Association] class L { No ref a; No2 ref b; };", "2:25", "a reference to a class that is not declared yet"},
        {embedded + "class X { [EmbeddedInstance(\"No\")] string a; [EmbeddedInstance(\"No2\")] string b; };", "2:97",
         "EmbeddedInstance of a class that is not declared yet"},
        {embedded + "class I {}; class X { [EmbeddedInstance(\"I\")] string a; };"
                    "instance of X { a = \"instance of I {};\"; }; instance of X { a = \"instance of I {};\"; };",
         "2:140", "an instance with a value of an embedded property"},
        {"class X { uint32 m(string Ref, X ref r); uint32 n(string rEF); };", "2:27", "a parameter named Ref"},
        {"Class X {}; CLASS Y {};", "2:1", "the word \"class\" in other letters than small ones"},
    };
    CompileOptions strict = options();
    strict.isStrict = true;
    for (const Row& row : rows) {
        const std::string place = row.place;
        const std::string text = std::string("fails on OpenPegasus 2.14: ") + row.kind;
        EXPECT_THAT(compile(row.text).warnings(),
                    testing::ElementsAre("t.mof:" + place + ": warning: works here, " + text))
            << row.text;
        EXPECT_EQ(failureOf(row.text, strict), place + ": " + text) << row.text;
    }
    const char* const portable = "[Association] class L { L ref self; }; class X { uint32 m(No ref p); };";
    EXPECT_THAT(compile(portable).warnings(), testing::IsEmpty());
    EXPECT_EQ(failureOf(portable, strict), "");
}

// Each row: instances whose references use aliases before they exist; the values that must come out.
TEST(Compiler, ResolvesAliasesInAnyOrder)
{
    const std::string schema = "class A { [Key] string id; A ref next; }; "
                               "class L { [Key] A ref one; [Key] A ref two; };\n";
    struct Row
    {
        const char* name;
        const char* text;
        std::vector<std::string> expected;
    };
    const Row rows[] = {
        {"backward",
         "instance of A as $a { id = \"1\"; }; instance of A { id = \"2\"; next = $A; };",
         {"instance A { string id=<1>; }", "instance A { string id=<2>; A ref next=<A.id=\"1\">; }"}},
        {"forward",
         "instance of A { id = \"2\"; next = $a; }; instance of A as $a { id = \"1\"; };",
         {"instance A { string id=<1>; }", "instance A { string id=<2>; A ref next=<A.id=\"1\">; }"}},
        {"circle",
         "instance of A as $a { id = \"1\"; next = $b; }; instance of A as $b { id = \"2\"; next = $a; };",
         {"instance A { string id=<2>; A ref next=<A.id=\"1\">; }",
          "instance A { string id=<1>; A ref next=<A.id=\"2\">; }"}},
        {"keysThroughAliases",
         "instance of L { one = $a; two = $b; }; instance of A as $b { id = \"2\"; }; "
         "instance of A as $a { id = \"1\"; };",
         {"instance A { string id=<2>; }", "instance A { string id=<1>; }",
          "instance L { A ref two=<A.id=\"2\">; A ref one=<A.id=\"1\">; }"}},
        {"text",
         "instance of A { id = \"2\"; next = \"root/x:A.id=\\\"1\\\"\"; };",
         {"instance A { string id=<2>; A ref next=<root/x:A.id=\"1\">; }"}},
    };
    for (const Row& row : rows) {
        std::vector<std::string> got;
        const MemoryHandler handler = compile(schema + row.text);
        for (const CIMInstance& instance : handler.instances()) {
            got.push_back(describe(instance));
        }
        EXPECT_THAT(got, testing::ElementsAreArray(row.expected)) << row.name;
    }
}

TEST(Compiler, DeliversEverythingInFrontOfTheFirstError)
{
    const char* const faults[] = {"class X { uint8 a = 256; };", "class X { nothing };", "§", "\"open",
                                  "instance of Nope {};",        "class X : Nope {};"};
    for (const char* fault : faults) {
        MemoryHandler handler;
        const std::string text = kQualifiers + "class A {};" + fault + " class B {};";
        EXPECT_THROW(compileText(text, "t.mof", options(), handler), MofError) << fault;
        ASSERT_EQ(handler.classes().size(), 1u) << fault;
        EXPECT_EQ(describe(handler.classes()[0]), "class A { }") << fault;
    }
}

// The compiler parses on while the handler creates a class; whoever watches the handler must not notice.
TEST(Compiler, CallsTheHandlerInTheOrderOfTheText)
{
    std::string many;
    std::string manyCalls;
    for (int i = 0; i < 300; ++i) {
        many += "class M" + std::to_string(i) + " {};";
        manyCalls += "M" + std::to_string(i) + ";";
    }
    struct Row
    {
        std::string text;
        std::string calls;
        const char* cause;
    };
    const Row rows[] = {
        {"class A {}; class A {}; #pragma other (\"x\")\nclass B {};", "A;A;warn t.mof:1:19;warn t.mof:1:40;B;", ""},
        {"class A {}; Qualifier Q : string, Scope(any); class B {}; instance of B {}; class C {};",
         "A;declare Q;B;instance of B;C;", ""},
        {"class A {}; class X : Nope {}; class B {};", "A;X;", "superclass does not exist: Nope"},
        {"class X : Nope {}; #pragma other (\"x\")\nclass B {};", "X;", "superclass does not exist: Nope"},
        {"class X : Nope {}; Qualifier Q : string, Scope(any);", "X;", "superclass does not exist: Nope"},
        {"class X : Nope {}; instance of X {};", "X;", "superclass does not exist: Nope"},
        {"class X : Nope {}; class { fault", "X;", "superclass does not exist: Nope"},
        {"class A {}; class { fault", "A;", "expected a class name instead of '{'"},
        {many, manyCalls, ""},
        {many + "class X : Nope {};" + many, manyCalls + "X;", "superclass does not exist: Nope"},
    };
    for (const Row& row : rows) {
        Recorder handler;
        std::string cause;
        try {
            compileText(row.text, "t.mof", options(), handler);
        } catch (const MofError& error) {
            cause = error.cause();
        }
        EXPECT_EQ(handler.calls, row.calls) << row.text.substr(0, 80);
        EXPECT_EQ(cause, row.cause) << row.text.substr(0, 80);
    }
}

// A text that is cut anywhere must deliver its whole definitions and end in an error within the text, if in any.
TEST(Compiler, SurvivesATextCutAtEveryLength)
{
    const std::string text =
        "// c\n[Version(\"1.0.0\")] class A { [Key] string id = \"\\x41\"; uint8 n[2] = {1, 0x2};\n"
        "/* c */ uint32 m([Description(\"p\")] A ref r[]); };\n"
        "instance of A as $a { id = 'x'; };";
    for (std::size_t size = 0; size < text.size(); ++size) {
        MemoryHandler handler;
        try {
            compileText(kQualifiers + text.substr(0, size), "t.mof", options(), handler);
        } catch (const MofError& error) {
            EXPECT_LE(error.place().line, 5u) << size;
        }
        EXPECT_LE(handler.classes().size(), size > text.find("};\ninstance") + 1 ? 1u : 0u) << size;
    }
}

TEST(Compiler, NamesTheLimitThatATextExceeds)
{
    struct Row
    {
        const char* name;
        std::string text;
        void (*tighten)(CompileLimits&);
        const char* within; // a text that the same limit lets through
    };
    const Row rows[] = {
        {"tokenBytes", "class Abcdefghijklmnop {};", [](CompileLimits& l) { l.tokenBytes = 15; },
         "class Abcdefghijklmno {};"},
        {"stringBytes", "[Description(\"abcdefgh\" \"ij\")] class A {};", [](CompileLimits& l) { l.stringBytes = 9; },
         "[Description(\"abcdefgh\" \"i\")] class A {};"},
        {"arrayElementCount", "class A { uint8 a[] = {1,2,3}; };", [](CompileLimits& l) { l.arrayElementCount = 2; },
         "class A { uint8 a[] = {1,2}; };"},
        {"arrayElementCount", "class A { uint8 a[3]; };", [](CompileLimits& l) { l.arrayElementCount = 2; },
         "class A { uint8 a[2]; };"},
        {"memberCount", "class A { uint8 a; uint8 b; uint8 c; };", [](CompileLimits& l) { l.memberCount = 2; },
         "class A { uint8 a; uint8 b; };"},
        {"memberCount", "class A { uint8 a(uint8 a, uint8 b, uint8 c); };", [](CompileLimits& l) { l.memberCount = 2; },
         "class A { uint8 a(uint8 a, uint8 b); };"},
        {"memberCount", "[Version(\"1.0.0\"), Description(\"d\"), Experimental(false)] class A {};",
         [](CompileLimits& l) { l.memberCount = 2; }, "[Version(\"1.0.0\"), Description(\"d\")] class A {};"},
    };
    for (const Row& row : rows) {
        CompileOptions tight = options();
        row.tighten(tight.limits);
        EXPECT_THAT(failureOf(row.text, tight), testing::HasSubstr(row.name)) << row.text;
        EXPECT_EQ(failureOf(row.within, tight), "") << row.within;
    }
}
