// SPDX-License-Identifier: MIT
#include "tests/pegasus/cmpi/replay/KnownDifferences.h"

// Where our answers to the recorded vendor's clients differ.
namespace servertest {

namespace {

const Edit kLibrary{"File \"libxtmissing.so\" was not found for provider module \"XtNoLib\".",
                    "For provider Xt the library name was empty. Check provider registered location."};
const Edit kCause{"cimprovagt \"XtModule\".<*>\n", "cimprovagt \"XtModule\".\n"};
const char kFirstError[] = "of several providers that fail, which one is reported depends on their order";

const KnownDifferences kRows = {
    {{"EI Base"},
     Why::kHost,
     kFirstError,
     {{"cimstatuscode: 2\ncimstatuscodedescription: CIM_ERR_ACCESS_DENIED: half way: d\xC3\xA9tail <&>\n",
       "cimstatuscode: 1\n"}},
     true},
    {{"EID Base"},
     Why::kHost,
     kFirstError,
     {{"CODE=2 DESCRIPTION=CIM_ERR_ACCESS_DENIED: half way: d\xC3\xA9tail <&>",
       "CODE=1 DESCRIPTION=CIM_ERR_FAILED: For provider Xt the library name was empty. Check provider registered "
       "location."}}},
    {{"EIN Base", "EI NoLib", "EID NoLib", "EIN NoLib"}, Why::kText, "names the file and the module", {kLibrary}},
    {{"EI Reals", "EID Reals"},
     Why::kTrap,
     "a real that is not finite is spelled as XML Schema does",
     {{"VALUE: INF\n", "VALUE: inf\n"}, {"VALUE: -INF\n", "VALUE: -inf\n"}, {"VALUE: NaN\n", "VALUE: nan\n"}}},
    {{"EI Chars", "EID Chars"},
     Why::kTrap,
     "half of a surrogate pair and a lone blank reach the client",
     {{"<VALUE>\xED\xA0\x80</VALUE>", "<VALUE>\\0</VALUE>"}, {"<VALUE>&#32;</VALUE>", "<VALUE> </VALUE>"}}},
    {{"EI ArrDateNull", "EID ArrDateNull"},
     Why::kTrap,
     "a null element becomes a valid interval of no length",
     {{"<VALUE>00000000000000.000000:000", "<VALUE>00000101000000.000000\\0000"}}},
    {{"EI ArrWrong", "EID ArrWrong"},
     Why::kDefect,
     "elements that do not fit are refused, not wrapped",
     {{"PROPERTY.ARRAY NAME=B TYPE=uint8\n", "PROPERTY.ARRAY ARRAYSIZE=2 NAME=B TYPE=uint8\n"
                                             "        VALUE.ARRAY\n         VALUE: 44\n         VALUE: 44\n"}}},
    {{"EI EmbArr"},
     Why::kTrap,
     "an array of embedded instances is delivered",
     {{"    IRETURNVALUE\n<*>", ""},
      {"cimoperation: MethodResponse\n",
       "cimoperation: MethodResponse\ncimstatuscode: 1\ncimstatuscodedescription: CIM_ERR_FAILED: Lost connection "
       "with cimprovagt \"XtModule\".\n"}}},
    {{"EID EmbArr"},
     Why::kTrap,
     "an array of embedded instances is delivered",
     {{"    IRETURNVALUE\n<*>",
       "    ERROR CODE=1 DESCRIPTION=CIM_ERR_FAILED: Lost connection with cimprovagt \"XtModule\".\n"}}},
    {{"EI EmbText", "EID EmbText"},
     Why::kTrap,
     "text is kept in a property of an embedded object",
     {{"PROPERTY NAME=EI TYPE=string\n        VALUE: instance of XT_Inner { Id = \"t\"; };\n",
       "PROPERTY EmbeddedObject=instance EMBEDDEDOBJECT=instance NAME=EI TYPE=string\n"},
      {"        VALUE: <INSTANCE CLASSNAME=\"XT_Inner\"></INSTANCE>\n", ""}}},
    {{"EI Bad", "EID Bad"}, Why::kTrap, "text that is not UTF-8 is repaired", {{"a\xEF\xBF\xBDz", "a\\xffz"}}},
    {{"EI Popen", "EID Popen"},
     Why::kHost,
     "the folder in which the server was started",
     {{"\n0\n<*>\n status", "\n0\nR/pegasus\n status"}}},
    {{"EI CrashMid", "EID CrashMid", "EI ExitMid", "EID ExitMid", "M Crash"},
     Why::kText,
     "the cause of the agent's end",
     {kCause}},
    {{"EIN Parent"},
     Why::kHost,
     "the order among classes varies from run to run",
     {{"CLASSNAME=XT_Parent\n<*>CLASSNAME=XT_Child\n",
       "CLASSNAME=XT_Child\n      KEYBINDING NAME=Id\n       KEYVALUE VALUETYPE=string: m\n"
       "     INSTANCENAME CLASSNAME=XT_Parent\n"}}},
    {{"EI Keys", "EID Keys"},
     Why::kPathKeys,
     "the keys of the path fill the key properties",
     {{"        VALUE: 200\n", ""},
      {"        VALUE: -5\n", ""},
      {"        VALUE: TRUE\n", ""},
      {"        VALUE: a\"b\\c\n", ""},
      {"        VALUE: 20240229235959.123456+120\n", ""},
      {"        VALUE: Z\n", ""}}},
    {{"EI KeyPathOnly", "EID KeyPathOnly"},
     Why::kPathKeys,
     "the keys of the path fill the key properties",
     {{"        VALUE: a\n", ""}, {"        VALUE: 9\n", ""}}},
    {{"EIN Link"},
     Why::kDefect,
     "a missing reference key is left out: without a value it is not CIM-XML",
     {{"      KEYBINDING NAME=Id\n",
       "      KEYBINDING NAME=From\n      KEYBINDING NAME=To\n      KEYBINDING NAME=Id\n"}}},
    {{"M All Nul"},
     Why::kDefect,
     "a null argument keeps its type",
     {{"NAME=ONul PARAMTYPE=string", "NAME=ONul PARAMTYPE=boolean"}}},
};

} // namespace

const KnownDifferences& differencesOfVendor()
{
    return kRows;
}

} // namespace servertest
