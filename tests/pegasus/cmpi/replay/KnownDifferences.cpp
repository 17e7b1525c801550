// SPDX-License-Identifier: MIT
#include "tests/pegasus/cmpi/replay/KnownDifferences.h"

namespace servertest {

namespace {

const char kLibrary[] = "File \"libxtmissing.so\" was not found for provider module \"XtNoLib\".";
const char kNamesLibrary[] = "names the file and the module";
const char kFirstError[] = "of several providers that fail, the error of the first one is reported";
const char kCause[] = "the cause of the agent's end is part of the text";
const char kNotFinite[] = "a real that is not finite: spelled as XML Schema does";
const char kKeys[] = "the keys of the path fill the key properties";
const char kNoCrash[] = "answers where the recorded agent crashes";
const char kDate[] = "a null element becomes a valid interval of no length";
const char kWrapped[] = "an element that does not fit is refused; the recorded broker wraps it";
const char kEmbedded[] = "text is kept in a property of an embedded object";
const char kUnknownClass[] = "an instance of an unknown class keeps the key of its path first, and is not cut";
const char kRepaired[] = "text that is not UTF-8 is repaired";
const char kWhere[] = "the folder in which the server was started";
const char kHead[] = "the head of the refusal was not recorded";
const char kKind[] = "taken, with a warning";
const char kOrderOfProviders[] = "classes answer in the order of the hierarchy, the recorded server's in any order";

} // namespace

const std::vector<KnownDifference>& differencesOfVendor()
{
    static const std::vector<KnownDifference> kRows = {
        {"EI Base", "cimstatuscode: ", kFirstError},
        {"EID Base", "ERROR CODE=2 DESCRIPTION=CIM_ERR_ACCESS_DENIED: half way", kFirstError},
        {"EIN Base", kLibrary, kFirstError},
        {"EI Reals", "VALUE: -INF", kNotFinite},
        {"EID Reals", "VALUE: -INF", kNotFinite},
        {"EI Chars", "<VALUE>\xED\xA0\x80</VALUE>", "half of a surrogate pair has its three bytes"},
        {"EID Chars", "<VALUE>\xED\xA0\x80</VALUE>", "half of a surrogate pair has its three bytes"},
        {"EI ArrDateNull", "VALUE: 00000000000000.000000:000", kDate},
        {"EID ArrDateNull", "VALUE: 00000000000000.000000:000", kDate},
        {"EI ArrWrong", "PROPERTY.ARRAY NAME=B TYPE=uint8\n", kWrapped},
        {"EID ArrWrong", "PROPERTY.ARRAY NAME=B TYPE=uint8\n", kWrapped},
        {"EI EmbArr", "VALUE: rc 0 0", kNoCrash},
        {"EID EmbArr", "VALUE: rc 0 0", kNoCrash},
        {"EI EmbText", "VALUE: instance of XT_Inner", kEmbedded},
        {"EID EmbText", "VALUE: instance of XT_Inner", kEmbedded},
        {"EI OtherNs", "VALUE: other namespace", kUnknownClass},
        {"EID OtherNs", "VALUE: other namespace", kUnknownClass},
        {"EI OtherClass", "VALUE: unknown class", kUnknownClass},
        {"EID OtherClass", "VALUE: unknown class", kUnknownClass},
        {"EI Bad", "VALUE: a\xEF\xBF\xBDz", kRepaired},
        {"EID Bad", "VALUE: a\xEF\xBF\xBDz", kRepaired},
        {"EI Popen", "status 700 system 300", kWhere},
        {"EID Popen", "status 700 system 300", kWhere},
        {"EI CrashMid", "\"XtModule\". killed by signal 11 (Segmentation fault)", kCause},
        {"EID CrashMid", "\"XtModule\". killed by signal 11 (Segmentation fault)", kCause},
        {"EI ExitMid", "\"XtModule\". exit status 3", kCause},
        {"EID ExitMid", "\"XtModule\". exit status 3", kCause},
        {"EI NoLib", kLibrary, kNamesLibrary},
        {"EID NoLib", kLibrary, kNamesLibrary},
        {"EIN NoLib", kLibrary, kNamesLibrary},
        {"EIN Parent", "INSTANCENAME CLASSNAME=XT_Child", kOrderOfProviders},
        {"EI Keys", "PROPERTY NAME=K8 TYPE=uint8\n        VALUE: 200", kKeys},
        {"EID Keys", "PROPERTY NAME=K8 TYPE=uint8\n        VALUE: 200", kKeys},
        {"EI KeyPathOnly", "PROPERTY NAME=N TYPE=uint32\n        VALUE: 9", kKeys},
        {"EID KeyPathOnly", "PROPERTY NAME=N TYPE=uint32\n        VALUE: 9", kKeys},
        {"EIN Link", "KEYVALUE VALUETYPE=string: m", "a missing reference key is left out: empty, it is not CIM-XML"},
        {"M All", "Invalid real number value", kHead},
        {"M All R64", "Invalid real number value", kHead},
        {"M All Nul", "NAME=ONul PARAMTYPE=string", "a null argument keeps its type"},
        {"M Crash", "\"XtModule\". killed by signal 11 (Segmentation fault)", kCause},
    };
    return kRows;
}

const std::vector<KnownDifference>& differencesOfProbes()
{
    static const std::vector<KnownDifference> kRows = {
        {"addKeys", "unknown: rc 0, Id: rc 0, Id as uint32: rc 0", kKind},
        {"argAtBeyond", "rc 12", "a status in place of an exception that ends the call"},
        {"arrayChars", "chars into string array rc 0", kKind},
        {"arrayTypes", "simple type of uint16A: 90 ", "the simple type has no array bit; null elements are taken"},
        {"associators", "NULL rc 7", "the server has no associations"},
        {"badArrayType", "NULL rc 61", "refuses a type that does not exist"},
        {"badUtf8", "61 ef bf bd 7a", kRepaired},
        {"classQualifier", "rc 7", "a function in place of a null slot"},
        {"context", "CMPIPrincipal={type 1600 state 0 'root'}", "providers ask for one name"},
        {"dateBinary", "18446744073709551615,1 -> NULL rc 4", "a status in place of an exception that ends the call"},
        {"dateReleasedInArray", "rc 0", kNoCrash},
        {"dates", "bin 1709243999123456 rc 0", "getBinaryFormat sets the status"},
        {"embeddedText", "rc 0", kKind},
        {"emptyArray", "state 0 array 0x1 n=0", "an empty array is not null"},
        {"execQuery", "NULL rc 7 ExecQuery", "names the operation"},
        {"fds", "0=/dev/null", "the agent's own descriptors"},
        {"hugeArray", "NULL rc 4", kNoCrash},
        {"keyTypes", "sint32 for uint16 rc 0", kKind},
        {"keysInInstance", "{type 1600 state 0 'k'}", kKeys},
        {"limits", "Max data size", "the limits of agents are properties of the server"},
        {"nullElementStrings", "{type 1600 state 0 ''}", "CIM arrays hold no nulls"},
        {"nullName", "NULL name rc 4", kNoCrash},
        {"objToString", "CMPIInstance //box/root/cimv2:TST_Root.Id=", "the path says which instance it is"},
        {"resolve", "libx.so", "a name is resolved"},
        {"selectExp", "NULL rc 14", "the server has no queries"},
        {"setNulls", "S NULL 0: rc 0", kKind},
        {"stringReleasedInArray", "rc 0", kNoCrash},
        {"threadOnce", "rc 0 0 count 1", "0 is success"},
        {"timedWait", "past: 110", "a timeout is reported"},
        {"upEnum", "Id={type 1600 state 0 '0'}", kKeys},
        {"upInvoke", "ft eft 200", "the same as versions"},
        {"upNames", "state 0 root/cimv2:TST_Item.Id=\"0\"", "a reference in an enumeration is a value"},
        {"upNullPath", "NULL rc 4", kNoCrash},
        {"versions", "ft eft 200 xft 200 mft 200", "has the memory functions, and claims what it does"},
    };
    return kRows;
}

} // namespace servertest
