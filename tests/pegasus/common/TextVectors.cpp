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
    table["client.timeout.default"] = [](const Vector&) { return CIMClient().getTimeout(); };
    const auto timeout = [](Uint32 milliseconds) {
        return [=](const Vector&) {
            CIMClient client;
            client.setTimeout(milliseconds);
            return client.getTimeout();
        };
    };
    table["client.timeout.set"] = timeout(65535000);
    table["client.timeout.zero"] = timeout(0);
    table["client.nc.invoke"] = [](const Vector&) {
        Array<CIMParamValue> outputs;
        return test::describe(
            CIMClient().invokeMethod("root", CIMObjectPath("A"), "M", Array<CIMParamValue>(), outputs));
    };
    table["client.nc.getQualifier"] = [](const Vector&) {
        return utf8(CIMClient().getQualifier("root", "Key").getName().getString());
    };
    table["client.nc.disconnect"] = [](const Vector&) {
        CIMClient().disconnect();
        return "no exception";
    };
    const auto connect = [](const char* host, Uint32 port) {
        return [=](const Vector&) {
            CIMClient().connect(host, port, "", "");
            return "connected";
        };
    };
    table["client.refused"] = connect("127.0.0.1", 1);
    table["client.badhost"] = connect("no.such.host.invalid", 5988);
}

void addArrayVectors(VectorTable& table)
{
    const auto one = [] { return Array<Uint32>(1, 1); };
    table["array.oob.nc"] = [=](const Vector&) { return one()[1]; };
    table["array.cow"] = [=](const Vector&) {
        const Array<Uint32> a = one();
        Array<Uint32> b = a;
        b.append(2);
        return json{a.size(), b.size()};
    };
    table["array.remove.oob"] = sizeOf([=] {
        Array<Uint32> array = one();
        array.remove(5);
        return array;
    });
    table["array.insert.oob"] = sizeOf([=] {
        Array<Uint32> array = one();
        array.insert(5, 1);
        return array;
    });
    table["array.size.ctor"] = [](const Vector&) {
        const Array<String> array(3);
        return json{array.size(), utf8(array[0])};
    };
    table["array.fill"] = [](const Vector&) { return Array<Uint32>(3, 7)[2]; };
}

} // namespace

void addExceptionVectors(VectorTable& table)
{
    table["type.toString."] = [](const Vector& v) { return cimTypeToString(CIMType(std::stoi(v.lastWord()))); };
    table["status.toString."] = [](const Vector& v) {
        return cimStatusCodeToString(CIMStatusCode(std::stoi(v.lastWord())));
    };
    table["exc.base"] = message([] { return Exception("abc"); });
    table["exc.cim.1"] = message([] { return CIMException(CIM_ERR_FAILED, "boom"); });
    table["exc.cim.0"] = [](const Vector&) {
        const CIMException exception;
        return json{utf8(exception.getMessage()), int(exception.getCode())};
    };
    table["exc.cim.nf"] = message([] { return CIMException(CIM_ERR_NOT_FOUND); });
    table["exc.http.1"] =
        message([] { return CIMClientHTTPErrorException(400, "Bad Request", "request-not-valid", "detail"); });
    table["exc.http.2"] = message([] { return CIMClientHTTPErrorException(401, "", "", ""); });
    table["exc.http.3"] = [](const Vector&) {
        return describe(CIMClientHTTPErrorException(503, "Service Unavailable", "", ""));
    };
    table["exc.http.4"] = message([] { return CIMClientHTTPErrorException(400, "err", "det"); });
    table["exc.malformed"] = message([] { return CIMClientMalformedHTTPException("m"); });
    table["exc.xml"] = message([] { return CIMClientXmlException("m"); });
    table["exc.response"] = message([] { return CIMClientResponseException("m"); });
    table["exc.idx"] = message([] { return IndexOutOfBoundsException(); });
    table["exc.exists"] = message([] { return AlreadyExistsException("x"); });
    table["exc.name"] = message([] { return InvalidNameException("x"); });
    table["exc.ns"] = message([] { return InvalidNamespaceNameException("x"); });
    table["exc.uninit"] = message([] { return UninitializedObjectException(); });
    table["exc.tm0"] = message([] { return TypeMismatchException(); });
    table["exc.dyn"] = message([] { return DynamicCastFailedException(); });
    table["exc.dt"] = message([] { return InvalidDateTimeFormatException(); });
    table["exc.dtr"] = message([] { return DateTimeOutOfRangeException("x"); });
    table["exc.mon"] = message([] { return MalformedObjectNameException("x"); });
    table["exc.bind"] = message([] { return BindFailedException("x"); });
    table["exc.loc"] = message([] { return InvalidLocatorException("x"); });
    table["exc.sock"] = message([] { return CannotCreateSocketException(); });
    table["exc.cc"] = message([] { return CannotConnectException("x"); });
    table["exc.ac"] = message([] { return AlreadyConnectedException(); });
    table["exc.to"] = message([] { return ConnectionTimeoutException(); });
    table["exc.ssl"] = message([] { return SSLException("x"); });
    table["exc.enumctx"] = message([] { return InvalidEnumerationContextException(); });
    addClientVectors(table);
}

void addStringVectors(VectorTable& table)
{
    const auto literal = [](const char* bytes) { return sizeOf([=] { return String(bytes); }); };
    table["str.utf8.size"] = literal("\xC3\xA9");
    table["str.utf8.astral"] = [](const Vector&) {
        const String emoji("\xF0\x9F\x98\x80");
        return json{emoji.size(), Uint16(emoji[0]), Uint16(emoji[1])};
    };
    table["str.utf8.bad"] = literal("\xC3\x28");
    table["str.utf8.trunc"] = literal("abc\xE5\x90");
    table["str.utf8.latin1"] = literal("caf\xE9 x");
    table["str.utf8.overlong"] = literal("\xC0\x80");
    table["str.utf8.surr"] = literal("\xED\xA0\x80");
    table["str.sub"] = [](const Vector&) { return utf8(String("abcdef").subString(2, 3)); };
    table["str.sub.oob"] = [](const Vector&) { return utf8(String("abc").subString(10)); };
    table["str.sub.long"] = [](const Vector&) { return utf8(String("abc").subString(1, 100)); };
    table["str.idx.oob"] = [](const Vector&) { return unitAt(3); };
    table["str.idx.oob3"] = [](const Vector&) { return unitAt(4); };
    table["str.cmp.len"] = [](const Vector&) {
        return json{String::compare("ab", "abc"), String::compare("ab", "abc", 2)};
    };
    table["str.equalNoCase.nonascii"] = [](const Vector&) { return String::equalNoCase("\xC3\xA9", "\xC3\x89"); };
    table["str.plus"] = [](const Vector&) { return json{utf8(String("a") + String("b")), utf8(String("a") + "c")}; };
    table["str.append"] = [](const Vector&) {
        String text("ab");
        return utf8(text.append(Char16('c')).append(String("d")));
    };
    table["str.remove"] = [](const Vector&) {
        String middle("abcd");
        middle.remove(1, 2);
        String end("abcd");
        end.remove(1);
        return json{utf8(middle), utf8(end)};
    };
    table["str.getcstring.roundtrip"] = [](const Vector&) { return utf8(String("é名😀")); };
    table["str.getcstring.lone"] = [](const Vector&) {
        String text("x");
        text[0] = Char16(0xD800);
        return hex(utf8(text.append(String("x"))));
    };
    table["str.char16ctor"] = [](const Vector&) {
        const Char16 units[] = {Char16(0x540D), Char16(0)};
        return utf8(String(units));
    };
    table["str.cow"] = [](const Vector&) {
        const String a("x");
        String b = a;
        b.append(String("y"));
        return utf8(a);
    };
    table["str.printf"] = [](const Vector&) {
        String text("p");
        text.appendPrintf("%d-%s", 5, "x");
        return utf8(text);
    };
    table["str.lt"] = [](const Vector&) { return String("a") < String("B"); };
    table["cstring.empty"] = [](const Vector&) { return std::string(String().getCString()); };
    table["c16.eq"] = [](const Vector&) { return Char16('A') == 'A'; };
    table["c16.stream"] = [](const Vector&) { return streamed(Char16('A')); };
    table["c16.stream2"] = [](const Vector&) { return streamed(Char16('A')); };
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

// The word before the last one in an id.
std::string firstOperand(const Vector& vector)
{
    const std::string head = vector.id.substr(0, vector.id.rfind('.'));
    return head.substr(head.rfind('.') + 1);
}

std::string sum(CIMFlavor flavor, const CIMFlavor& added)
{
    flavor.addFlavor(added);
    return utf8(flavor.toString());
}

} // namespace

void addFlagVectors(VectorTable& table)
{
    table["flavor.toString."] = [](const Vector& v) { return utf8(flavors().at(v.lastWord()).toString()); };
    table["flavor.has."] = [](const Vector& v) {
        return flavors().at(firstOperand(v)).hasFlavor(flavors().at(v.lastWord()));
    };
    table["flavor.pair."] = [](const Vector& v) {
        return utf8((flavors().at(firstOperand(v)) + flavors().at(v.lastWord())).toString());
    };
    table["flavor.add.disable"] = [](const Vector&) { return sum(CIMFlavor::DEFAULTS, CIMFlavor::DISABLEOVERRIDE); };
    table["flavor.add.enable"] = [](const Vector&) {
        return sum(CIMFlavor::DISABLEOVERRIDE, CIMFlavor::ENABLEOVERRIDE);
    };
    table["flavor.add.tosub"] = [](const Vector&) { return sum(CIMFlavor::RESTRICTED, CIMFlavor::TOSUBCLASS); };
    table["flavor.remove"] = [](const Vector&) {
        CIMFlavor flavor = CIMFlavor::DEFAULTS + CIMFlavor::TRANSLATABLE;
        flavor.removeFlavor(CIMFlavor::TRANSLATABLE);
        return utf8(flavor.toString());
    };
    table["flavor.default"] = [](const Vector&) { return utf8(CIMFlavor().toString()); };

    table["scope.toString."] = [](const Vector& v) { return utf8(scopes().at(v.lastWord()).toString()); };
    table["scope.pair."] = [](const Vector& v) {
        return utf8((scopes().at(firstOperand(v)) + scopes().at(v.lastWord())).toString());
    };
    table["scope.all7"] = [](const Vector&) {
        CIMScope all;
        for (const auto& [name, scope] : scopes()) {
            if (name != "ANY") {
                all.addScope(scope);
            }
        }
        return json{utf8(all.toString()), all.equal(CIMScope::ANY), all.hasScope(CIMScope::ANY)};
    };
    table["scope.any.has"] = [](const Vector&) {
        return json{CIMScope::ANY.hasScope(CIMScope::CLASS), CIMScope::CLASS.hasScope(CIMScope::ANY),
                    CIMScope::CLASS.hasScope(CIMScope::NONE)};
    };
    table["scope.six"] = [](const Vector&) {
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
