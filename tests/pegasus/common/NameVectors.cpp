#include "tests/pegasus/common/VectorTable.h"

#include <algorithm>

using namespace Pegasus;

namespace test {
namespace {

CIMKeyBinding key(const char* name, const char* value, CIMKeyBinding::Type type = CIMKeyBinding::STRING)
{
    return CIMKeyBinding(name, String(value), type);
}

CIMObjectPath build(const char* host, const char* nameSpace, const char* className,
                    std::initializer_list<CIMKeyBinding> keys = {})
{
    return CIMObjectPath(host, *nameSpace ? CIMNamespaceName(nameSpace) : CIMNamespaceName(), className,
                         Array<CIMKeyBinding>(keys.begin(), static_cast<Uint32>(keys.size())));
}

json comparePaths(const Vector& vector)
{
    const std::size_t middle = vector.input.find(" == ");
    return CIMObjectPath(text(vector.input.substr(0, middle))) == CIMObjectPath(text(vector.input.substr(middle + 4)));
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
    table["name.legal."] = [](const Vector& v) { return CIMName::legal(text(v.quoted())); };
    table["name.ctor."] = [](const Vector& v) { return utf8(CIMName(v.quoted().c_str()).getString()); };
    table["name.ctorS."] = [](const Vector& v) { return utf8(CIMName(text(v.quoted())).getString()); };
    table["name.equal.case"] = [](const Vector&) { return CIMName("Foo") == CIMName("fOO"); };
    table["name.equal.diff"] = [](const Vector&) { return CIMName("Foo") == CIMName("Bar"); };
    table["name.equal.nullnull"] = [](const Vector&) { return CIMName() == CIMName(); };
    table["name.clear"] = [](const Vector&) {
        CIMName name("a");
        name.clear();
        return name.isNull();
    };
    table["ns.legal."] = [](const Vector& v) { return CIMNamespaceName::legal(text(v.quoted())); };
    table["ns.ctor."] = [](const Vector& v) { return utf8(CIMNamespaceName(v.quoted().c_str()).getString()); };
    table["ns.ctorS."] = [](const Vector& v) { return utf8(CIMNamespaceName(text(v.quoted())).getString()); };
    table["ns.equal.case"] = [](const Vector&) {
        return CIMNamespaceName("root/cimv2") == CIMNamespaceName("ROOT/CIMV2");
    };
    table["ns.null"] = [](const Vector&) {
        return json{CIMNamespaceName().isNull(), utf8(CIMNamespaceName().getString())};
    };
}

void addPathVectors(VectorTable& table)
{
    const auto build = [](auto... arguments) {
        return [=](const Vector&) { return describe(test::build(arguments...)); };
    };
    table["path.parse."] = [](const Vector& v) { return describe(CIMObjectPath(text(v.quoted()))); };
    table["path.build.class"] = build("", "root/cimv2", "CIM_Foo");
    table["path.build.host"] = build("h1", "root/cimv2", "CIM_Foo");
    table["path.build.host.nons"] = build("h1", "", "CIM_Foo");
    const auto keyed = [](const char* nameSpace, const char* className, std::vector<CIMKeyBinding> keys) {
        return [=](const Vector&) {
            return describe(CIMObjectPath("", *nameSpace ? CIMNamespaceName(nameSpace) : CIMNamespaceName(), className,
                                          Array<CIMKeyBinding>(keys.data(), static_cast<Uint32>(keys.size()))));
        };
    };
    table["path.build.order"] =
        keyed("root/cimv2", "CIM_Foo", {key("c", "3", CIMKeyBinding::NUMERIC), key("B", "2"), key("a", "1")});
    table["path.build.order2"] =
        keyed("", "CIM_Foo", {key("Key10", "3", CIMKeyBinding::NUMERIC), key("Key2", "2"), key("key1", "1")});
    table["path.build.quote"] = keyed("", "CIM_Foo", {key("A", "a\"b\\c")});
    table["path.build.bool"] = keyed("", "CIM_Foo", {key("A", "TRUE", CIMKeyBinding::BOOLEAN)});
    table["path.build.bool.bad"] = keyed("", "CIM_Foo", {key("A", "perhaps", CIMKeyBinding::BOOLEAN)});
    table["path.build.num.bad"] = keyed("", "CIM_Foo", {key("A", "abc", CIMKeyBinding::NUMERIC)});
    table["path.build.ref"] =
        keyed("root/cimv2", "Assoc", {key("Left", "root/cimv2:X.K=\"a\\\"b\"", CIMKeyBinding::REFERENCE)});
    table["path.eq."] = comparePaths;
    table["path.sethost.bad"] = [](const Vector&) { return withHost("A.K=1", "a b"); };
    table["path.sethost.nons"] = [](const Vector&) { return withHost("A.K=1", "h"); };
    table["path.setns"] = [](const Vector&) {
        CIMObjectPath path("A.K=1");
        path.setNameSpace("root/x");
        return describe(path);
    };
    table["path.hash.order"] = [](const Vector&) {
        return CIMObjectPath("A.K=\"1\",L=2").makeHashCode() == CIMObjectPath("A.L=2,K=\"1\"").makeHashCode();
    };
    const auto fromValue = [](const CIMValue& value) {
        return [=](const Vector&) {
            static const char* const kTypes[] = {"BOOLEAN", "STRING", "NUMERIC", "REFERENCE"};
            const CIMKeyBinding binding("A", value);
            return json{utf8(binding.getValue()), kTypes[binding.getType()]};
        };
    };
    table["kb.fromvalue.bool"] = fromValue(CIMValue(true));
    table["kb.fromvalue.s64"] = fromValue(CIMValue(Sint64(-5)));
    table["kb.fromvalue.char"] = fromValue(CIMValue(Char16('x')));
    table["kb.eq.num.hex"] = [](const Vector&) {
        return key("A", "16", CIMKeyBinding::NUMERIC) == key("A", "0x10", CIMKeyBinding::NUMERIC);
    };
    table["kb.eq.bool.case"] = [](const Vector&) {
        return key("A", "TRUE", CIMKeyBinding::BOOLEAN) == key("A", "true", CIMKeyBinding::BOOLEAN);
    };
}

void addDateTimeVectors(VectorTable& table)
{
    static const char* const kStamp = "20200101000000.000000+000";
    static const char* const kInterval = "00000001000000.000000:000";
    table["dt.parse."] = [](const Vector& v) { return describe(CIMDateTime(text(v.quoted()))); };
    table["dt.default"] = [](const Vector&) {
        const CIMDateTime dateTime;
        return json{utf8(dateTime.toString()), dateTime.isInterval(), dateTime.toMicroSeconds()};
    };
    table["dt.usec."] = [](const Vector& v) {
        const std::size_t open = v.input.find('(');
        const Uint64 microseconds = std::stoull(v.input.substr(open + 1));
        return utf8(CIMDateTime(microseconds, v.input.find("true") != std::string::npos).toString());
    };
    table["dt.eq.utc"] = [](const Vector&) {
        return CIMDateTime("20200101010000.000000+060").equal(CIMDateTime(kStamp));
    };
    table["dt.eq.intvs"] = [](const Vector&) { return CIMDateTime(kInterval).equal(CIMDateTime(kStamp)); };
    table["dt.lt"] = [](const Vector&) { return CIMDateTime(kStamp) < CIMDateTime("20210101000000.000000+000"); };
    table["dt.lt.mix"] = [](const Vector&) { return CIMDateTime(kStamp) < CIMDateTime(kInterval); };
    table["dt.diff"] = [](const Vector&) {
        return CIMDateTime::getDifference(CIMDateTime(kStamp), CIMDateTime("20200102000000.000000+000"));
    };
    table["dt.diff.mix"] = [](const Vector&) {
        return CIMDateTime::getDifference(CIMDateTime(kStamp), CIMDateTime(kInterval));
    };
    table["dt.set.bad"] = [](const Vector&) {
        CIMDateTime dateTime;
        dateTime.set("bad");
        return describe(dateTime);
    };
    table["dt.now.shape"] = [](const Vector&) {
        const CIMDateTime now = CIMDateTime::getCurrentDateTime();
        const std::string shown = utf8(now.toString());
        return json{shown.size(), now.isInterval(), shown.substr(14, 1)};
    };
    table["dt.clear"] = [](const Vector&) {
        CIMDateTime dateTime(kStamp);
        dateTime.clear();
        return utf8(dateTime.toString());
    };
}

} // namespace test
