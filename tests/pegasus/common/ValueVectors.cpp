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

// "Real64(1.5)"
double realIn(const Vector& vector)
{
    return std::strtod(vector.input.c_str() + vector.input.find('(') + 1, nullptr);
}

json typedNull(const Vector& vector, bool isArray)
{
    return describe(CIMValue(CIMType(std::stoi(vector.lastWord())), isArray));
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
    if (type == "ArrayUint8") {
        return got(value, Array<Uint8>(1, 77)).size();
    }
    return got(value, Array<String>(1, String("unset"))).size();
}

CIMInstance fooInstance()
{
    CIMInstance instance("Foo");
    instance.addProperty(CIMProperty("P", CIMValue(Uint32(1))));
    return instance;
}

void addScalars(VectorTable& table)
{
    table["value.default"] = shown(CIMValue());
    table["value.bool.t"] = shown(true);
    table["value.bool.f"] = shown(false);
    table["value.u8"] = shown(Uint8(255));
    table["value.u16"] = shown(Uint16(65535));
    table["value.s16"] = shown(Sint16(-32768));
    table["value.u32"] = shown(Uint32(4294967295u));
    table["value.s32"] = shown(std::numeric_limits<Sint32>::min());
    table["value.u64"] = shown(std::numeric_limits<Uint64>::max());
    table["value.s64"] = shown(std::numeric_limits<Sint64>::min());
    table["value.r32."] = [](const Vector& v) { return describe(CIMValue(Real32(realIn(v)))); };
    table["value.r64."] = [](const Vector& v) { return describe(CIMValue(Real64(realIn(v)))); };
    table["value.c16.e9"] = shown(Char16(0xE9));
    table["value.c16.5408"] = shown(Char16(0x540D));
    table["value.c16.lt"] = shown(Char16('<'));
    table["value.c16.space"] = shown(Char16(' '));
    table["value.c16.0"] = shown(Char16(0));
    table["value.str.empty"] = shown(String());
    table["value.dt"] = shown(CIMDateTime("20200101000000.000000+000"));
    table["value.dt.iv"] = shown(CIMDateTime("00000001020304.000005:000"));
    table["value.ref"] = shown(CIMObjectPath("root/cimv2:A.K=\"1\""));
    table["value.inst"] = shown(fooInstance());
    table["value.obj.class"] = shown(CIMObject(CIMClass("Foo", "Sup")));
    table["value.const.char"] = shown(String("lit"));
    table["value.null."] = [](const Vector& v) { return typedNull(v, false); };
    table["value.nullarr."] = [](const Vector& v) { return typedNull(v, true); };
    table["value.nullarr.sized"] = shown(CIMValue(CIMTYPE_UINT8, true, 4));
    table["value.ctor.sizedscalar"] = shown(CIMValue(CIMTYPE_UINT8, false, 4));
}

void addArrays(VectorTable& table)
{
    table["value.arr.bool"] = shown(arrayOf<Boolean>({true, false}));
    table["value.arr.u8"] = shown(arrayOf<Uint8>({1, 2, 3}));
    table["value.arr.u8.empty"] = shown(Array<Uint8>());
    table["value.arr.str"] = shown(arrayOf<String>({"a", "", "b c"}));
    table["value.arr.str.empty"] = shown(Array<String>());
    table["value.arr.c16"] = shown(arrayOf<Char16>({Char16('A'), Char16('B')}));
    table["value.arr.r64"] = shown(arrayOf<Real64>({1, 0.5}));
    table["value.arr.ref"] = shown(arrayOf<CIMObjectPath>({CIMObjectPath("A.K=1"), CIMObjectPath("B.K=2")}));
    table["value.arr.s64"] = shown(arrayOf<Sint64>({-1, std::numeric_limits<Sint64>::max()}));
}

void addComparisons(VectorTable& table)
{
    const CIMValue nullBoolean(CIMTYPE_BOOLEAN, false);
    table["value.eq.bool"] = equals(true, true);
    table["value.eq.bool2"] = equals(true, false);
    table["value.eq.type"] = equals(Uint8(1), Uint16(1));
    table["value.eq.nullvs"] = equals(CIMValue(CIMTYPE_STRING, false), String());
    table["value.eq.nullbool.true"] = equals(nullBoolean, true);
    table["value.eq.default"] = equals(CIMValue(), CIMValue());
    table["value.eq.default.bool"] = equals(CIMValue(), nullBoolean);
    table["value.eq.strcase"] = equals(String("a"), String("A"));
    table["value.eq.nullarr"] = equals(CIMValue(CIMTYPE_UINT8, true), Array<Uint8>());
    table["value.eq.arrscalar"] = equals(CIMValue(CIMTYPE_UINT8, true), CIMValue(CIMTYPE_UINT8, false));
    table["value.eq.r"] = equals(Real64(0.1), Real64(0.1));
    table["value.eq.strbool"] = equals(String("true"), true);
    table["value.eq.boolarr"] = equals(true, arrayOf<Boolean>({true}));
    table["value.eq.ref"] = equals(CIMObjectPath("A.K=1,L=2"), CIMObjectPath("a.l=2,k=1"));
    table["value.eq.dtutc"] =
        equals(CIMDateTime("20200101010000.000000+060"), CIMDateTime("20200101000000.000000+000"));
    table["value.typeCompatible"] = [](const Vector&) {
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
    table["value.set.changes.type"] = changed(String("s"), [](CIMValue& v) { v.set(Uint32(5)); });
    table["value.set.on.default"] = changed(CIMValue(), [](CIMValue& v) { v.set(String("q")); });
    table["value.clear"] = changed(five, [](CIMValue& v) { v.clear(); });
    table["value.setNull"] = changed(five, [](CIMValue& v) { v.setNullValue(CIMTYPE_STRING, false); });
    table["value.copy"] = [five](const Vector&) {
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
    table["get."] = [](const Vector& v) {
        const std::size_t kind = v.id.find('.') + 1;
        const std::size_t type = v.id.find('.', kind) + 1;
        return getAs(kinds().at(v.id.substr(kind, type - kind - 1)), v.id.substr(type));
    };
}

} // namespace test
