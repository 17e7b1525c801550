// SPDX-License-Identifier: MIT
#include "tests/pegasus/common/VectorTable.h"

using namespace Pegasus;

namespace test {
namespace {

CIMKeyBinding key(const char* name, const char* value, CIMKeyBinding::Type type = CIMKeyBinding::STRING)
{
    return CIMKeyBinding(name, String(value), type);
}

json compare(const Vector& vector)
{
    const String left = text(vector.arguments[0]);
    const String right = text(vector.arguments[1]);
    constexpr Uint32 kDateTimeSize = 25;
    if (left.size() == kDateTimeSize && left[14] == '.') {
        return CIMDateTime(left).equal(CIMDateTime(right));
    }
    return CIMObjectPath(left) == CIMObjectPath(right);
}

json withHost(const char* path, const char* host)
{
    CIMObjectPath result(path);
    result.setHost(host);
    return describe(result);
}

} // namespace

void addNameVectors(VectorTable& table)
{
    table["CIMName::legal(*)"] = [](const Vector& v) { return CIMName::legal(text(v.quoted())); };
    table["CIMName(const char* *).getString()"] = [](const Vector& v) {
        return utf8(CIMName(v.quoted().c_str()).getString());
    };
    table["CIMName(String *).getString()"] = [](const Vector& v) {
        return utf8(CIMName(text(v.quoted())).getString());
    };
    table["CIMName(\"*\")==CIMName(\"*\")"] = [](const Vector& v) {
        return CIMName(v.arguments[0].c_str()) == CIMName(v.arguments[1].c_str());
    };
    table["CIMName()==CIMName()"] = [](const Vector&) { return CIMName() == CIMName(); };
    table["CIMName n(\"a\"); n.clear(); isNull"] = [](const Vector&) {
        CIMName name("a");
        name.clear();
        return name.isNull();
    };
    table["CIMNamespaceName::legal(*)"] = [](const Vector& v) { return CIMNamespaceName::legal(text(v.quoted())); };
    table["CIMNamespaceName(*).getString()"] = [](const Vector& v) {
        return utf8(CIMNamespaceName(v.quoted().c_str()).getString());
    };
    table["CIMNamespaceName(String *).getString()"] = [](const Vector& v) {
        return utf8(CIMNamespaceName(text(v.quoted())).getString());
    };
    table["CIMNamespaceName(*)==CIMNamespaceName(*)"] = [](const Vector& v) {
        return CIMNamespaceName(v.arguments[0].c_str()) == CIMNamespaceName(v.arguments[1].c_str());
    };
    table["CIMNamespaceName().isNull(), getString()"] = [](const Vector&) {
        return json{CIMNamespaceName().isNull(), utf8(CIMNamespaceName().getString())};
    };
}

void addPathVectors(VectorTable& table)
{
    table["CIMObjectPath(*)"] = [](const Vector& v) { return describe(CIMObjectPath(text(v.quoted()))); };
    table["(*,*,*)"] = [](const Vector& v) {
        const std::string& host = v.arguments[0];
        const std::string& nameSpace = v.arguments[1];
        return describe(CIMObjectPath(host == "\"\"" ? String() : text(host),
                                      nameSpace == "null ns" ? CIMNamespaceName() : CIMNamespaceName(text(nameSpace)),
                                      CIMName(text(v.arguments[2]))));
    };
    const auto keyed = [](const char* nameSpace, const char* className, std::vector<CIMKeyBinding> keys) {
        return [=](const Vector&) {
            return describe(CIMObjectPath("", *nameSpace ? CIMNamespaceName(nameSpace) : CIMNamespaceName(), className,
                                          Array<CIMKeyBinding>(keys.data(), static_cast<Uint32>(keys.size()))));
        };
    };
    table["keys appended in order c,B,a"] =
        keyed("root/cimv2", "CIM_Foo", {key("c", "3", CIMKeyBinding::NUMERIC), key("B", "2"), key("a", "1")});
    table["keys appended in order Key10,Key2,key1"] =
        keyed("", "CIM_Foo", {key("Key10", "3", CIMKeyBinding::NUMERIC), key("Key2", "2"), key("key1", "1")});
    const auto keyOf = [](CIMKeyBinding::Type type) {
        return [type](const Vector& v) {
            return describe(CIMObjectPath("", CIMNamespaceName(), "CIM_Foo",
                                          Array<CIMKeyBinding>(1, key("A", v.arguments[0].c_str(), type))));
        };
    };
    table["string key *"] = keyOf(CIMKeyBinding::STRING);
    table["boolean key value *"] = keyOf(CIMKeyBinding::BOOLEAN);
    table["numeric key value *"] = keyOf(CIMKeyBinding::NUMERIC);
    table["reference key"] =
        keyed("root/cimv2", "Assoc", {key("Left", "root/cimv2:X.K=\"a\\\"b\"", CIMKeyBinding::REFERENCE)});
    table["* == *"] = compare;
    table["setHost(\"*\")"] = [](const Vector& v) { return withHost("A.K=1", v.arguments[0].c_str()); };
    table["setHost(*) without namespace"] = [](const Vector& v) { return withHost("A.K=1", v.arguments[0].c_str()); };
    table["set namespace then toString"] = [](const Vector&) {
        CIMObjectPath path("A.K=1");
        path.setNameSpace("root/x");
        return describe(path);
    };
    table["makeHashCode equal for key order variants"] = [](const Vector&) {
        return CIMObjectPath("A.K=\"1\",L=2").makeHashCode() == CIMObjectPath("A.L=2,K=\"1\"").makeHashCode();
    };
    const auto fromValue = [](const CIMValue& value) {
        return [=](const Vector&) {
            static const char* const kTypes[] = {"BOOLEAN", "STRING", "NUMERIC", "REFERENCE"};
            const CIMKeyBinding binding("A", value);
            return json{utf8(binding.getValue()), kTypes[binding.getType()]};
        };
    };
    table["CIMKeyBinding(A,CIMValue(true))"] = fromValue(CIMValue(true));
    table["CIMKeyBinding(A,CIMValue(Sint64(-5)))"] = fromValue(CIMValue(Sint64(-5)));
    table["CIMKeyBinding(A,CIMValue(Char16('x')))"] = fromValue(CIMValue(Char16('x')));
    table["kb(A,\"*\",*)==kb(A,\"*\",*)"] = [](const Vector& v) {
        static const std::map<std::string, CIMKeyBinding::Type> kTypes = {{"BOOLEAN", CIMKeyBinding::BOOLEAN},
                                                                          {"STRING", CIMKeyBinding::STRING},
                                                                          {"NUMERIC", CIMKeyBinding::NUMERIC}};
        const auto one = [&v](std::size_t at) {
            return key("A", v.arguments[at].c_str(), kTypes.at(v.arguments[at + 1]));
        };
        return one(0) == one(2);
    };
}

void addDateTimeVectors(VectorTable& table)
{
    static const char* const kStamp = "20200101000000.000000+000";
    static const char* const kInterval = "00000001000000.000000:000";
    table["CIMDateTime(*): toString/isInterval/toMicroSeconds"] = [](const Vector& v) {
        return describe(CIMDateTime(text(v.quoted())));
    };
    table["CIMDateTime() toString/isInterval/usec"] = [](const Vector&) {
        const CIMDateTime dateTime;
        return json{utf8(dateTime.toString()), dateTime.isInterval(), dateTime.toMicroSeconds()};
    };
    table["CIMDateTime(*,*).toString()"] = [](const Vector& v) {
        return utf8(CIMDateTime(v.number(), v.arguments[1] == "true").toString());
    };
    table["interval == timestamp"] = [](const Vector&) { return CIMDateTime(kInterval).equal(CIMDateTime(kStamp)); };
    table["2020 < 2021"] = [](const Vector&) { return CIMDateTime(kStamp) < CIMDateTime("20210101000000.000000+000"); };
    table["timestamp < interval"] = [](const Vector&) { return CIMDateTime(kStamp) < CIMDateTime(kInterval); };
    table["getDifference(20200101..,20200102..)"] = [](const Vector&) {
        return CIMDateTime::getDifference(CIMDateTime(kStamp), CIMDateTime("20200102000000.000000+000"));
    };
    table["getDifference(timestamp,interval)"] = [](const Vector&) {
        return CIMDateTime::getDifference(CIMDateTime(kStamp), CIMDateTime(kInterval));
    };
    table["CIMDateTime t; t.set(\"bad\")"] = [](const Vector&) {
        CIMDateTime dateTime;
        dateTime.set("bad");
        return describe(dateTime);
    };
    table["getCurrentDateTime(): length, isInterval, char 14"] = [](const Vector&) {
        const CIMDateTime now = CIMDateTime::getCurrentDateTime();
        const std::string shown = utf8(now.toString());
        return json{shown.size(), now.isInterval(), shown.substr(14, 1)};
    };
    table["t=2020..; clear(); toString"] = [](const Vector&) {
        CIMDateTime dateTime(kStamp);
        dateTime.clear();
        return utf8(dateTime.toString());
    };
}

} // namespace test
