// SPDX-License-Identifier: MIT
#include "tests/pegasus/common/VectorTable.h"

#include <Pegasus/Client/CIMClient.h>

#include <sstream>

using namespace Pegasus;

namespace test {
namespace {

Evaluator message(std::function<Exception()> make)
{
    return [make = std::move(make)](const Vector&) { return utf8(make().getMessage()); };
}

// An exception that is made of a text.
template <typename Made> void addException(VectorTable& table, const std::string& name)
{
    table[name + "(\"*\").getMessage()"] = [](const Vector& v) {
        return utf8(Made(text(v.arguments[0])).getMessage());
    };
}

json describe(const CIMClientHTTPErrorException& error)
{
    return {utf8(error.getMessage()), error.getCode(), utf8(error.getCIMError()), utf8(error.getCIMErrorDetail())};
}

std::string streamed(const Char16& unit)
{
    std::ostringstream out;
    out << unit;
    return out.str();
}

std::string hex(const std::string& bytes)
{
    std::string out;
    for (const char byte : bytes) {
        char digits[3];
        std::snprintf(digits, sizeof(digits), "%02x", static_cast<unsigned>(static_cast<unsigned char>(byte)));
        out += digits;
    }
    return out;
}

// Of both kinds of index: that of a changeable string and that of a const one.
json unitAt(Uint32 index)
{
    String text("abc");
    const Uint16 changeable = text[index];
    const Uint16 fixed = static_cast<const String&>(text)[index];
    return changeable == fixed ? json(changeable) : json("they differ");
}

template <typename Make> Evaluator sizeOf(Make make)
{
    return [make](const Vector&) { return make().size(); };
}

void addClientVectors(VectorTable& table)
{
    table["CIMClient().getTimeout()"] = [](const Vector&) { return CIMClient().getTimeout(); };
    table["setTimeout(*); getTimeout()"] = [](const Vector& v) {
        CIMClient client;
        client.setTimeout(static_cast<Uint32>(v.number()));
        return client.getTimeout();
    };
    table["unconnected invokeMethod"] = [](const Vector&) {
        Array<CIMParamValue> outputs;
        return test::describe(
            CIMClient().invokeMethod("root", CIMObjectPath("A"), "M", Array<CIMParamValue>(), outputs));
    };
    table["unconnected getQualifier"] = [](const Vector&) {
        return utf8(CIMClient().getQualifier("root", "Key").getName().getString());
    };
    table["unconnected disconnect()"] = [](const Vector&) {
        CIMClient().disconnect();
        return "no exception";
    };
    const auto connect = [](const char* host, Uint32 port) {
        return [=](const Vector&) {
            CIMClient().connect(host, port, "", "");
            return "connected";
        };
    };
    table["connect(\"127.0.0.1\",1,\"\",\"\") with nothing listening"] = connect("127.0.0.1", 1);
    table["connect(\"no.such.host.invalid\",5988,\"\",\"\")"] = connect("no.such.host.invalid", 5988);
}

void addArrayVectors(VectorTable& table)
{
    const auto one = [] { return Array<Uint32>(1, 1); };
    table["Array<Uint32>{1}[1] non-const"] = [=](const Vector&) { return one()[1]; };
    table["b=a; b.append; sizes"] = [=](const Vector&) {
        const Array<Uint32> a = one();
        Array<Uint32> b = a;
        b.append(2);
        return json{a.size(), b.size()};
    };
    table["remove(5)"] = sizeOf([=] {
        Array<Uint32> array = one();
        array.remove(5);
        return array;
    });
    table["insert(5,x) on size 1"] = sizeOf([=] {
        Array<Uint32> array = one();
        array.insert(5, 1);
        return array;
    });
    table["Array<String>(3): size and element"] = [](const Vector&) {
        const Array<String> array(3);
        return json{array.size(), utf8(array[0])};
    };
    table["Array<Uint32>(3,7)[2]"] = [](const Vector&) { return Array<Uint32>(3, 7)[2]; };
}

void addDecodingVectors(VectorTable& table)
{
    const auto literal = [](const char* bytes) { return sizeOf([=] { return String(bytes); }); };
    table["String(UTF-8 é) size"] = literal("\xC3\xA9");
    table["String(UTF-8 😀) size and units"] = [](const Vector&) {
        const String emoji("\xF0\x9F\x98\x80");
        return json{emoji.size(), Uint16(emoji[0]), Uint16(emoji[1])};
    };
    table["String(invalid UTF-8 C3 28)"] = literal("\xC3\x28");
    table["String(truncated UTF-8 'abc' E5 90)"] = literal("abc\xE5\x90");
    table["String(Latin-1 E9 then text)"] = literal("caf\xE9 x");
    table["String(overlong C0 80)"] = literal("\xC0\x80");
    table["String(UTF-8 surrogate ED A0 80)"] = literal("\xED\xA0\x80");
}

} // namespace

void addExceptionVectors(VectorTable& table)
{
    table["cimTypeToString(CIMType(*))"] = [](const Vector& v) { return cimTypeToString(CIMType(v.number())); };
    table["cimStatusCodeToString(*)"] = [](const Vector& v) {
        return cimStatusCodeToString(CIMStatusCode(v.number()));
    };
    addException<Exception>(table, "Exception");
    table["CIMException(CIM_ERR_FAILED,\"boom\").getMessage()"] =
        message([] { return CIMException(CIM_ERR_FAILED, "boom"); });
    table["CIMException().getMessage(), getCode()"] = [](const Vector&) {
        const CIMException exception;
        return json{utf8(exception.getMessage()), int(exception.getCode())};
    };
    table["CIMException(CIM_ERR_NOT_FOUND).getMessage()"] = message([] { return CIMException(CIM_ERR_NOT_FOUND); });
    table["CIMClientHTTPErrorException(*,\"*\",\"*\",\"*\").getMessage()"] = [](const Vector& v) {
        return utf8(CIMClientHTTPErrorException(static_cast<Uint32>(v.number()), text(v.arguments[1]),
                                                text(v.arguments[2]), text(v.arguments[3]))
                        .getMessage());
    };
    table["CIMClientHTTPErrorException(503,\"Service Unavailable\",\"\",\"\") "
          "getMessage/getCode/getCIMError/getCIMErrorDetail"] = [](const Vector&) {
        return describe(CIMClientHTTPErrorException(503, "Service Unavailable", "", ""));
    };
    table["CIMClientHTTPErrorException(400,\"err\",\"det\") (3-arg ctor) getMessage"] =
        message([] { return CIMClientHTTPErrorException(400, "err", "det"); });
    addException<CIMClientMalformedHTTPException>(table, "CIMClientMalformedHTTPException");
    addException<CIMClientXmlException>(table, "CIMClientXmlException");
    addException<CIMClientResponseException>(table, "CIMClientResponseException");
    table["IndexOutOfBoundsException().getMessage()"] = message([] { return IndexOutOfBoundsException(); });
    addException<AlreadyExistsException>(table, "AlreadyExistsException");
    addException<InvalidNameException>(table, "InvalidNameException");
    addException<InvalidNamespaceNameException>(table, "InvalidNamespaceNameException");
    table["UninitializedObjectException().getMessage()"] = message([] { return UninitializedObjectException(); });
    table["TypeMismatchException().getMessage()"] = message([] { return TypeMismatchException(); });
    table["DynamicCastFailedException().getMessage()"] = message([] { return DynamicCastFailedException(); });
    table["InvalidDateTimeFormatException().getMessage()"] = message([] { return InvalidDateTimeFormatException(); });
    addException<DateTimeOutOfRangeException>(table, "DateTimeOutOfRangeException");
    addException<MalformedObjectNameException>(table, "MalformedObjectNameException");
    addException<BindFailedException>(table, "BindFailedException");
    addException<InvalidLocatorException>(table, "InvalidLocatorException");
    table["CannotCreateSocketException().getMessage()"] = message([] { return CannotCreateSocketException(); });
    addException<CannotConnectException>(table, "CannotConnectException");
    table["AlreadyConnectedException().getMessage()"] = message([] { return AlreadyConnectedException(); });
    table["ConnectionTimeoutException().getMessage()"] = message([] { return ConnectionTimeoutException(); });
    addException<SSLException>(table, "SSLException");
    table["InvalidEnumerationContextException().getMessage()"] =
        message([] { return InvalidEnumerationContextException(); });
    addClientVectors(table);
}

void addStringVectors(VectorTable& table)
{
    addDecodingVectors(table);
    table["subString(*,*) of *"] = [](const Vector& v) {
        return utf8(text(v.arguments[2]).subString(static_cast<Uint32>(v.number()), static_cast<Uint32>(v.number(1))));
    };
    table["subString(*) of *"] = [](const Vector& v) {
        return utf8(text(v.arguments[1]).subString(static_cast<Uint32>(v.number())));
    };
    table["String(abc)[3] non-const / const"] = [](const Vector&) { return unitAt(3); };
    table["String(abc)[4] non-const"] = [](const Vector&) { return unitAt(4); };
    table["compare(\"ab\",\"abc\"), compare n=2"] = [](const Vector&) {
        return json{String::compare("ab", "abc"), String::compare("ab", "abc", 2)};
    };
    table["equalNoCase(é,É)"] = [](const Vector&) { return String::equalNoCase("\xC3\xA9", "\xC3\x89"); };
    table["String+String; String + literal"] = [](const Vector&) {
        return json{utf8(String("a") + String("b")), utf8(String("a") + "c")};
    };
    table["append(Char16), append(String)"] = [](const Vector&) {
        String text("ab");
        return utf8(text.append(Char16('c')).append(String("d")));
    };
    table["remove(1,2) of abcd; remove(1)"] = [](const Vector&) {
        String middle("abcd");
        middle.remove(1, 2);
        String end("abcd");
        end.remove(1);
        return json{utf8(middle), utf8(end)};
    };
    table["getCString of é名😀"] = [](const Vector&) { return utf8(String("é名😀")); };
    table["getCString of lone surrogate D800: byte length"] = [](const Vector&) {
        String text("x");
        text[0] = Char16(0xD800);
        return hex(utf8(text.append(String("x"))));
    };
    table["String(const Char16*) with 0x540D"] = [](const Vector&) {
        const Char16 units[] = {Char16(0x540D), Char16(0)};
        return utf8(String(units));
    };
    table["b=a; b.append; a"] = [](const Vector&) {
        const String a("x");
        String b = a;
        b.append(String("y"));
        return utf8(a);
    };
    table["appendPrintf(\"%d-%s\",5,\"x\")"] = [](const Vector&) {
        String text("p");
        text.appendPrintf("%d-%s", 5, "x");
        return utf8(text);
    };
    table["\"a\"<\"B\" (code unit order)"] = [](const Vector&) { return String("a") < String("B"); };
    table["String().getCString() is empty text"] = [](const Vector&) { return std::string(String().getCString()); };
    table["Char16('A')=='A'"] = [](const Vector&) { return Char16('A') == 'A'; };
    table["ostream << Uint16(Char16('A'))"] = [](const Vector&) { return streamed(Char16('A')); };
    table["ostream << Char16('A') (implicit conversion to Uint16)"] = [](const Vector&) {
        return streamed(Char16('A'));
    };
    addArrayVectors(table);
}

namespace {

const std::map<std::string, CIMFlavor>& flavors()
{
    static const std::map<std::string, CIMFlavor> table = {
        {"NONE", CIMFlavor::NONE},
        {"OVERRIDABLE", CIMFlavor::OVERRIDABLE},
        {"ENABLEOVERRIDE", CIMFlavor::ENABLEOVERRIDE},
        {"DISABLEOVERRIDE", CIMFlavor::DISABLEOVERRIDE},
        {"TOSUBCLASS", CIMFlavor::TOSUBCLASS},
        {"RESTRICTED", CIMFlavor::RESTRICTED},
        {"TOINSTANCE", CIMFlavor::TOINSTANCE},
        {"TRANSLATABLE", CIMFlavor::TRANSLATABLE},
        {"DEFAULTS", CIMFlavor::DEFAULTS},
        {"TOSUBELEMENTS", CIMFlavor::TOSUBELEMENTS},
    };
    return table;
}

const std::map<std::string, CIMScope>& scopes()
{
    static const std::map<std::string, CIMScope> table = {
        {"NONE", CIMScope::NONE},
        {"CLASS", CIMScope::CLASS},
        {"ASSOCIATION", CIMScope::ASSOCIATION},
        {"INDICATION", CIMScope::INDICATION},
        {"PROPERTY", CIMScope::PROPERTY},
        {"REFERENCE", CIMScope::REFERENCE},
        {"METHOD", CIMScope::METHOD},
        {"PARAMETER", CIMScope::PARAMETER},
        {"ANY", CIMScope::ANY},
    };
    return table;
}

// A sum of flavors: "A" or "A+B".
CIMFlavor flavorOf(const std::string& words)
{
    const std::size_t plus = words.find('+');
    const CIMFlavor first = flavors().at(words.substr(0, plus));
    return plus == std::string::npos ? first : first + flavors().at(words.substr(plus + 1));
}

} // namespace

void addFlagVectors(VectorTable& table)
{
    table["CIMFlavor::*.toString()"] = [](const Vector& v) { return utf8(flavors().at(v.arguments[0]).toString()); };
    table["CIMFlavor::*.hasFlavor(*)"] = [](const Vector& v) {
        return flavors().at(v.arguments[0]).hasFlavor(flavors().at(v.arguments[1]));
    };
    table["(*+*).toString()"] = [](const Vector& v) {
        const std::string& left = v.arguments[0];
        const std::string& right = v.arguments[1];
        return utf8(scopes().count(left) != 0 && scopes().count(right) != 0
                        ? (scopes().at(left) + scopes().at(right)).toString()
                        : (flavors().at(left) + flavors().at(right)).toString());
    };
    table["f=*; addFlavor(*)"] = [](const Vector& v) {
        CIMFlavor flavor = flavorOf(v.arguments[0]);
        flavor.addFlavor(flavorOf(v.arguments[1]));
        return utf8(flavor.toString());
    };
    table["f=*; removeFlavor(*)"] = [](const Vector& v) {
        CIMFlavor flavor = flavorOf(v.arguments[0]);
        flavor.removeFlavor(flavorOf(v.arguments[1]));
        return utf8(flavor.toString());
    };
    table["CIMFlavor().toString()"] = [](const Vector&) { return utf8(CIMFlavor().toString()); };

    table["CIMScope::*.toString()"] = [](const Vector& v) { return utf8(scopes().at(v.arguments[0]).toString()); };
    table["sum of all seven"] = [](const Vector&) {
        CIMScope all;
        for (const auto& [name, scope] : scopes()) {
            if (name != "ANY") {
                all.addScope(scope);
            }
        }
        return json{utf8(all.toString()), all.equal(CIMScope::ANY), all.hasScope(CIMScope::ANY)};
    };
    table["ANY.hasScope(CLASS), CLASS.hasScope(ANY), CLASS.hasScope(NONE)"] = [](const Vector&) {
        return json{CIMScope::ANY.hasScope(CIMScope::CLASS), CIMScope::CLASS.hasScope(CIMScope::ANY),
                    CIMScope::CLASS.hasScope(CIMScope::NONE)};
    };
    table["all but PARAMETER"] = [](const Vector&) {
        CIMScope six;
        for (const auto& [name, scope] : scopes()) {
            if (name != "ANY" && name != "PARAMETER") {
                six.addScope(scope);
            }
        }
        return utf8(six.toString());
    };
}

} // namespace test
