// SPDX-License-Identifier: MIT
#include "tests/pegasus/cmpi/replay/KnownDifferences.h"

// Where our broker answers the recorded probes differently.
namespace servertest {

namespace {

const char kAgentEnds[] = "!! 200 OK (1, 'CIM_ERR_FAILED: Lost connection with cimprovagt \"PbModule\".')";
const char kEnds[] = "the recorded agent crashes";
const char kThrows[] = "a status in place of an exception that ends the call";
const Edit kMemory{"caps c107 hdl 1; ft eft 200 xft 200 mft 200", "caps 81ff hdl 1; ft eft 200 xft 200 mft -1"};

const KnownDifferences kRows = {
    {{"argAtBeyond"},
     Why::kCrash,
     kThrows,
     {{"{type 0 state 500}rc 12", "!! 200 OK (1, 'CIM_ERR_FAILED: index out of bounds')"}}},
    {{"arrayChars"}, Why::kTrap, "taken", {{"chars into string array rc 0", "chars into string array rc 13"}}},
    {{"arrayTypes"},
     Why::kTrap,
     "setElementAt takes null elements; the recorded value has bytes that were never set",
     {{"{type 90 state 0 1}", "{type 90 state 0 56199d240001}"},
      {"set NULL,null rc 0", "set NULL,null rc 4"},
      {"set NULL,uint16 rc 0", "set NULL,uint16 rc 4"}}},
    {{"associators"},
     Why::kNotServed,
     "associations",
     {{"NULL rc 7 Associators refnames NULL rc 7 ReferenceNames", "made rc 0 (NULL) refnames made rc 0 (NULL)"}}},
    {{"badUtf8"}, Why::kTrap, "repaired", {{"61 ef bf bd 7a", "61 ff 7a"}}},
    {{"classQualifier"},
     Why::kNotServed,
     "class qualifiers: a status in place of a null slot",
     {{"{type 0 state 500}rc 7", "slot is NULL"}}},
    {{"context"}, Why::kHost, "the user whom the server knows", {{"state 0 'root'", "state 0 ''"}}},
    {{"dateBinary"},
     Why::kCrash,
     kThrows,
     {{"0,0 -> 19700101000000.000000+000 rc 0; 0,1 -> 00000000000000.000000:000 rc 0; "
       "1,0 -> 19700101000000.000001+000 rc 0; 1,1 -> 00000000000000.000001:000 rc 0; "
       "1700000000123456,0 -> 20231114221320.123456+000 rc 0; "
       "1700000000123456,1 -> 00019675221320.123456:000 rc 0; "
       "253402300799999999,0 -> 99991231235959.999999+000 rc 0; "
       "253402300799999999,1 -> 02932896235959.999999:000 rc 0; "
       "18446744073709551615,0 -> 19691231235959.999999+000 rc 0; 18446744073709551615,1 -> NULL rc 4; ",
       "!! 200 OK (1, 'CIM_ERR_FAILED: DateTime is out of range : Cannot create a CIMDateTime interval greater "
       "than 100 million days')"}}},
    {{"dateReleasedInArray"}, Why::kTrap, kEnds, {{"rc 0 {type 3800 state 0 array 0x1 n=1}", kAgentEnds}}},
    {{"dates"}, Why::kDefect, "getBinaryFormat sets the status", {{" rc 0 interval", " rc 9 interval"}}},
    {{"embeddedText"},
     Why::kTrap,
     "text is kept",
     {{"rc 0 {type 1600 state 0 'just text'}", "rc 61 {type 1000 state 100}"}}},
    {{"fds"}, Why::kHost, "the descriptors of an agent", {{" 1=<*>", nullptr}}},
    {{"hugeArray"}, Why::kCrash, kEnds, {{"4 G elements: NULL rc 4", kAgentEnds}}},
    {{"keyTypes"},
     Why::kDefect,
     "a key of 64 bits is kept, not wrapped",
     {{"state 200 11170}", "state 200 1170}"}, {"Number=70000", "Number=4464"}}},
    {{"keysInInstance"}, Why::kPathKeys, "", {{"{type 1600 state 0 'k'}", "{type 1600 state 100}"}}},
    {{"limits"},
     Why::kHost,
     "an agent's limits",
     {{"Max file size<*>\n", nullptr},
      {"Max data size<*>\n", nullptr},
      {"Max stack size<*>\n", nullptr},
      {"Max core file size<*>\n", nullptr},
      {"Max processes<*>\n", nullptr},
      {"Max open files<*>\n", nullptr},
      {"Max locked memory<*>\n", nullptr},
      {"Max pending signals<*>\n", nullptr}}},
    {{"nullElementStrings"},
     Why::kDefect,
     "CIM arrays hold no nulls",
     {{"{type 1600 state 0 ''}", "{type 1600 state 100}"}}},
    {{"nullName"}, Why::kCrash, kEnds, {{"NULL name rc 4", kAgentEnds}}},
    {{"objToString"},
     Why::kText,
     "the path says which instance it is",
     {{" inst: :CMPIInstance //box/root/cimv2:TST_Root.Id=\"a\\\"b\"",
       " inst: : Instance of TST_Root {\n  string Id = ;\n  string Text = ;\n  string WithDefault = "
       "given;\n};\n"}}},
    {{"resolve"}, Why::kHost, "the recorded machine has no such library", {{"libx.so", ""}}},
    {{"selectExp"}, Why::kNotServed, "queries", {{"NULL rc 14", "made rc 0"}}},
    {{"setNulls"},
     Why::kTrap,
     "taken",
     {{"S NULL 0: rc 0", "S NULL 0: rc 61"},
      {"S &0 0: rc 0", "S &0 0: rc 61"},
      {"U32 NULL 0: rc 0", "U32 NULL 0: rc 61"},
      {"U16A NULL 0: rc 0", "U16A NULL 0: rc 61"}}},
    {{"stringReleasedInArray"}, Why::kTrap, kEnds, {{"{type 1600 state 0 'one'}rc 0", kAgentEnds}}},
    {{"timedWait"}, Why::kDefect, "a timeout is reported", {{"past: 110", "past: 0"}}},
    {{"upEnum"}, Why::kPathKeys, "", {{"Id={type 1600 state 0 '0'}", "Id={type 1600 state 100}"}}},
    {{"upInvoke", "versions"}, Why::kNotServed, "has the memory functions, and claims what it has", {kMemory}},
    {{"upNames"},
     Why::kDefect,
     "a reference and a property that were read are values",
     {{"{type 1100 state 0 root/cimv2:TST_Item.Id=\"0\"}", "{type 1100 state 100}"},
      {"'item 0'}{type 1600 state 0 '0'}", "'item 0'}{type 1600 state 100}"},
      {"\"0\"{type 1600 state 0 'item 0'}", "\"0\"{type 1600 state 100}"}}},
    {{"upNullPath"}, Why::kCrash, kEnds, {{"NULL rc 4", kAgentEnds}}},
};

} // namespace

const KnownDifferences& differencesOfProbes()
{
    return kRows;
}

} // namespace servertest
