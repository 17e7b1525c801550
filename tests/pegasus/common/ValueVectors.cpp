// SPDX-License-Identifier: MIT
#include "tests/pegasus/common/VectorTable.h"

#include <cmath>
#include <limits>

using namespace Pegasus;

namespace test {
namespace {

template <typename T> Evaluator shown(const T& x)
{
    return [value = CIMValue(x)](const Vector&) { return describe(value); };
}

template <typename T> CIMValue arrayOf(std::initializer_list<T> items)
{
    return CIMValue(Array<T>(items.begin(), static_cast<Uint32>(items.size())));
}

Evaluator equals(const CIMValue& x, const CIMValue& y)
{
    return [=](const Vector&) { return x == y; };
}

template <typename T> Evaluator integer()
{
    return [](const Vector& v) {
        return describe(CIMValue(v.arguments[0][0] == '-' ? static_cast<T>(std::stoll(v.arguments[0]))
                                                          : static_cast<T>(v.number())));
    };
}

template <typename T> Evaluator real()
{
    return [](const Vector& v) {
        return describe(CIMValue(static_cast<T>(std::strtod(v.arguments[0].c_str(), nullptr))));
    };
}

Evaluator typedNull(bool isArray)
{
    return [=](const Vector& v) { return describe(CIMValue(CIMType(v.number()), isArray)); };
}

// The values that get() is tried on; each number is 1.
const std::map<std::string, CIMValue>& kinds()
{
    static const std::map<std::string, CIMValue> table = {
        {"bool", CIMValue(true)},
        {"u8", CIMValue(Uint8(1))},
        {"s32", CIMValue(Sint32(1))},
        {"u64", CIMValue(Uint64(1))},
        {"r64", CIMValue(Real64(1))},
        {"c16", CIMValue(Char16('c'))},
        {"str", CIMValue(String("s"))},
        {"dt", CIMValue(CIMDateTime("20200101000000.000000+000"))},
        {"ref", CIMValue(CIMObjectPath("A.K=1"))},
        {"arrU8", CIMValue(Array<Uint8>())},
        {"nullStr", CIMValue(CIMTYPE_STRING, false)},
        {"nullU32", CIMValue(CIMTYPE_UINT32, false)},
        {"nullArrStr", CIMValue(CIMTYPE_STRING, true)},
        {"default", CIMValue()},
    };
    return table;
}

// get() into a variable that holds `before`.
template <typename T> T got(const CIMValue& value, T before)
{
    value.get(before);
    return before;
}

json getAs(const CIMValue& value, const std::string& type)
{
    if (type == "Boolean") {
        return got(value, false);
    }
    if (type == "Uint8") {
        return got(value, Uint8(77));
    }
    if (type == "Uint16") {
        return got(value, Uint16(77));
    }
    if (type == "Uint32") {
        return got(value, Uint32(77));
    }
    if (type == "Sint32") {
        return got(value, Sint32(77));
    }
    if (type == "String") {
        return utf8(got(value, String("unset")));
    }
    if (type == "CIMDateTime") {
        return utf8(got(value, CIMDateTime()).toString());
    }
    if (type == "CIMObjectPath") {
        return utf8(got(value, CIMObjectPath()).toString());
    }
    if (type == "Array<Uint8>") {
        return got(value, Array<Uint8>(1, 77)).size();
    }
    if (type == "Array<String>") {
        return got(value, Array<String>(1, String("unset"))).size();
    }
    throw std::out_of_range(type);
}

CIMInstance fooInstance()
{
    CIMInstance instance("Foo");
    instance.addProperty(CIMProperty("P", CIMValue(Uint32(1))));
    return instance;
}

void addScalars(VectorTable& table)
{
    table["CIMValue()"] = shown(CIMValue());
    table["CIMValue(true)"] = shown(true);
    table["CIMValue(false)"] = shown(false);
    table["Uint8(*)"] = integer<Uint8>();
    table["Uint16(*)"] = integer<Uint16>();
    table["Uint32(*)"] = integer<Uint32>();
    table["Uint64(*)"] = integer<Uint64>();
    table["Sint8(*)"] = integer<Sint8>();
    table["Sint16(*)"] = integer<Sint16>();
    table["Sint32(*)"] = integer<Sint32>();
    table["Sint64(*)"] = integer<Sint64>();
    table["Sint64(min)"] = shown(std::numeric_limits<Sint64>::min());
    table["Real32(*)"] = real<Real32>();
    table["Real64(*)"] = real<Real64>();
    table["Char16(*)"] = [](const Vector& v) { return describe(CIMValue(Char16(static_cast<Uint16>(v.number())))); };
    table["Char16('<')"] = shown(Char16('<'));
    table["String(\"\")"] = shown(String());
    table["CIMDateTime(20200101000000.000000+000)"] = shown(CIMDateTime("20200101000000.000000+000"));
    table["interval 00000001020304.000005:000"] = shown(CIMDateTime("00000001020304.000005:000"));
    table["CIMObjectPath(root/cimv2:A.K=\"1\")"] = shown(CIMObjectPath("root/cimv2:A.K=\"1\""));
    table["CIMValue(CIMInstance(Foo){P=Uint32 1})"] = shown(fooInstance());
    table["CIMValue(CIMObject(CIMClass(Foo)))"] = shown(CIMObject(CIMClass("Foo", "Sup")));
    table["CIMValue from string literal via String"] = shown(String("lit"));
    table["CIMValue(CIMType(*),false)"] = typedNull(false);
    table["CIMValue(CIMType(*),true)"] = typedNull(true);
    table["CIMValue(CIMTYPE_UINT8,true,4)"] = shown(CIMValue(CIMTYPE_UINT8, true, 4));
    table["CIMValue(CIMTYPE_UINT8,false,4)"] = shown(CIMValue(CIMTYPE_UINT8, false, 4));
}

void addArrays(VectorTable& table)
{
    table["Array<Boolean>{true,false}"] = shown(arrayOf<Boolean>({true, false}));
    table["Array<Uint8>{1,2,3}"] = shown(arrayOf<Uint8>({1, 2, 3}));
    table["Array<Uint8>{}"] = shown(Array<Uint8>());
    table["Array<String>{a,\"\",b c}"] = shown(arrayOf<String>({"a", "", "b c"}));
    table["Array<String>{}"] = shown(Array<String>());
    table["Array<Char16>{A,B}"] = shown(arrayOf<Char16>({Char16('A'), Char16('B')}));
    table["Array<Real64>{1,0.5}"] = shown(arrayOf<Real64>({1, 0.5}));
    table["Array<CIMObjectPath>{A.K=1,B.K=2}"] =
        shown(arrayOf<CIMObjectPath>({CIMObjectPath("A.K=1"), CIMObjectPath("B.K=2")}));
    table["Array<Sint64>{-1,9223372036854775807}"] = shown(arrayOf<Sint64>({-1, std::numeric_limits<Sint64>::max()}));
}

void addComparisons(VectorTable& table)
{
    const CIMValue nullBoolean(CIMTYPE_BOOLEAN, false);
    table["true==true"] = equals(true, true);
    table["true==false"] = equals(true, false);
    table["Uint8(1)==Uint16(1)"] = equals(Uint8(1), Uint16(1));
    table["null string==String(\"\")"] = equals(CIMValue(CIMTYPE_STRING, false), String());
    table["null boolean==true"] = equals(nullBoolean, true);
    table["CIMValue()==CIMValue()"] = equals(CIMValue(), CIMValue());
    table["CIMValue()==null boolean"] = equals(CIMValue(), nullBoolean);
    table["String(a)==String(A)"] = equals(String("a"), String("A"));
    table["null uint8 array == empty uint8 array"] = equals(CIMValue(CIMTYPE_UINT8, true), Array<Uint8>());
    table["null uint8 array == null uint8"] = equals(CIMValue(CIMTYPE_UINT8, true), CIMValue(CIMTYPE_UINT8, false));
    table["Real64(0.1)==Real64(0.1)"] = equals(Real64(0.1), Real64(0.1));
    table["String(true)==Boolean(true)"] = equals(String("true"), true);
    table["Boolean(true)==Array<Boolean>{true}"] = equals(true, arrayOf<Boolean>({true}));
    table["A.K=1,L=2 == a.l=2,k=1"] = equals(CIMObjectPath("A.K=1,L=2"), CIMObjectPath("a.l=2,k=1"));
    table["01:00+060 == 00:00+000"] =
        equals(CIMDateTime("20200101010000.000000+060"), CIMDateTime("20200101000000.000000+000"));
    table["Uint8(1).typeCompatible(null uint8), vs array"] = [](const Vector&) {
        const CIMValue value(Uint8(1));
        return json{value.typeCompatible(CIMValue(CIMTYPE_UINT8, false)),
                    value.typeCompatible(CIMValue(CIMTYPE_UINT8, true))};
    };
}

// A value that is changed by `change`.
template <typename Change> Evaluator changed(const CIMValue& before, Change change)
{
    return [=](const Vector&) {
        CIMValue value = before;
        change(value);
        return describe(value);
    };
}

void addChanges(VectorTable& table)
{
    const CIMValue five(Uint32(5));
    table["v=String; v.set(Uint32(5)) changes type"] = changed(String("s"), [](CIMValue& v) { v.set(Uint32(5)); });
    table["CIMValue v; v.set(String)"] = changed(CIMValue(), [](CIMValue& v) { v.set(String("q")); });
    table["v=Uint32(5); clear()"] = changed(five, [](CIMValue& v) { v.clear(); });
    table["v=Uint32(5); setNullValue(CIMTYPE_STRING,false)"] =
        changed(five, [](CIMValue& v) { v.setNullValue(CIMTYPE_STRING, false); });
    table["a=Uint32(5); b=a; b.set(6); a unaffected"] = [five](const Vector&) {
        CIMValue copy = five;
        copy.set(Uint32(6));
        return json{utf8(five.toString()), utf8(copy.toString())};
    };
}

} // namespace

void addValueVectors(VectorTable& table)
{
    addScalars(table);
    addArrays(table);
    addComparisons(table);
    addChanges(table);
    table["value of kind * get(*)"] = [](const Vector& v) { return getAs(kinds().at(v.arguments[0]), v.arguments[1]); };
}

} // namespace test
