// SPDX-License-Identifier: MIT
#include "tools/mofcompare/ClassComparison.h"

#include "pegasus/base/Text.h"

using namespace Pegasus;

namespace mofcompare {

namespace {

std::string shown(const CIMName& name)
{
    return name.isNull() ? "(none)" : base::utf8(name);
}

// Embedded objects are declared and sent as strings.
std::string shown(CIMType type)
{
    const bool isEmbedded = type == CIMTYPE_OBJECT || type == CIMTYPE_INSTANCE;
    return cimTypeToString(isEmbedded ? CIMTYPE_STRING : type);
}

std::string shown(const CIMValue& value)
{
    return shown(value.getType()) + (value.isArray() ? "[] " : " ") +
           (value.isNull() ? "null" : "\"" + base::utf8(value.toString()) + "\"");
}

// The two flavors that every declaration decides.
std::string shown(const CIMFlavor& flavor)
{
    std::string text = flavor.hasFlavor(CIMFlavor::OVERRIDABLE) ? "overridable" : "not overridable";
    text += flavor.hasFlavor(CIMFlavor::TOSUBCLASS) ? ", to subclass" : ", restricted";
    text += flavor.hasFlavor(CIMFlavor::TRANSLATABLE) ? ", translatable" : "";
    return text + (flavor.hasFlavor(CIMFlavor::TOINSTANCE) ? ", to instance" : "");
}

// Walks over two objects side by side and collects what differs.
class Comparison
{
  public:
    explicit Comparison(const Declarations& declarations) : fDeclarations(declarations) {}

    void compareClass(const CIMConstClass& source, const CIMConstClass& readBack);
    std::vector<std::string> take() { return std::move(fLines); }

  private:
    void expectEqual(const std::string& where, const std::string& source, const std::string& readBack);
    template <typename Owner>
    void compareQualifiers(const std::string& where, const Owner& source, const Owner& readBack);
    void compareQualifier(const std::string& where, const CIMConstQualifier& source, const CIMConstQualifier& readBack);
    void compareProperty(const std::string& where, const CIMConstProperty& source, const CIMConstProperty& readBack);
    void compareMethod(const std::string& where, const CIMConstMethod& source, const CIMConstMethod& readBack);
    void compareParameter(const std::string& where, const CIMConstParameter& source, const CIMConstParameter& readBack);
    CIMFlavor flavorOf(const CIMConstQualifier& use) const;

    const Declarations& fDeclarations;
    std::vector<std::string> fLines;
};

void Comparison::expectEqual(const std::string& where, const std::string& source, const std::string& readBack)
{
    if (source != readBack) {
        fLines.push_back(where + ": " + source + " in the source, " + readBack + " read back");
    }
}

CIMFlavor Comparison::flavorOf(const CIMConstQualifier& use) const
{
    CIMQualifierDecl declaration;
    const bool isSilent = use.getFlavor().equal(CIMFlavor());
    return isSilent && fDeclarations(use.getName(), declaration) ? declaration.getFlavor() : use.getFlavor();
}

void Comparison::compareQualifier(const std::string& where, const CIMConstQualifier& source,
                                  const CIMConstQualifier& readBack)
{
    expectEqual(where, shown(source.getName()), shown(readBack.getName()));
    expectEqual(where, shown(source.getValue()), shown(readBack.getValue()));
    expectEqual(where, shown(flavorOf(source)), shown(readBack.getFlavor()));
}

template <typename Owner>
void Comparison::compareQualifiers(const std::string& where, const Owner& source, const Owner& readBack)
{
    expectEqual(where + " qualifiers", std::to_string(source.getQualifierCount()),
                std::to_string(readBack.getQualifierCount()));
    for (Uint32 i = 0; i < source.getQualifierCount() && i < readBack.getQualifierCount(); ++i) {
        compareQualifier(where + " [" + shown(source.getQualifier(i).getName()) + "]", source.getQualifier(i),
                         readBack.getQualifier(i));
    }
}

void Comparison::compareProperty(const std::string& where, const CIMConstProperty& source,
                                 const CIMConstProperty& readBack)
{
    expectEqual(where, shown(source.getName()), shown(readBack.getName()));
    expectEqual(where, shown(source.getValue()), shown(readBack.getValue()));
    expectEqual(where + " array size", std::to_string(source.getArraySize()), std::to_string(readBack.getArraySize()));
    expectEqual(where + " reference class", shown(source.getReferenceClassName()),
                shown(readBack.getReferenceClassName()));
    compareQualifiers(where, source, readBack);
}

void Comparison::compareParameter(const std::string& where, const CIMConstParameter& source,
                                  const CIMConstParameter& readBack)
{
    expectEqual(where, shown(source.getName()), shown(readBack.getName()));
    expectEqual(where, shown(source.getType()), shown(readBack.getType()));
    expectEqual(where + " array", std::to_string(source.isArray()), std::to_string(readBack.isArray()));
    expectEqual(where + " array size", std::to_string(source.getArraySize()), std::to_string(readBack.getArraySize()));
    expectEqual(where + " reference class", shown(source.getReferenceClassName()),
                shown(readBack.getReferenceClassName()));
    compareQualifiers(where, source, readBack);
}

void Comparison::compareMethod(const std::string& where, const CIMConstMethod& source, const CIMConstMethod& readBack)
{
    expectEqual(where, shown(source.getName()), shown(readBack.getName()));
    expectEqual(where, shown(source.getType()), shown(readBack.getType()));
    compareQualifiers(where, source, readBack);
    expectEqual(where + " parameters", std::to_string(source.getParameterCount()),
                std::to_string(readBack.getParameterCount()));
    for (Uint32 i = 0; i < source.getParameterCount() && i < readBack.getParameterCount(); ++i) {
        compareParameter(where + "(" + shown(source.getParameter(i).getName()) + ")", source.getParameter(i),
                         readBack.getParameter(i));
    }
}

void Comparison::compareClass(const CIMConstClass& source, const CIMConstClass& readBack)
{
    const std::string where = shown(source.getClassName());
    expectEqual(where, shown(source.getClassName()), shown(readBack.getClassName()));
    expectEqual(where + " superclass", shown(source.getSuperClassName()), shown(readBack.getSuperClassName()));
    compareQualifiers(where, source, readBack);
    expectEqual(where + " properties", std::to_string(source.getPropertyCount()),
                std::to_string(readBack.getPropertyCount()));
    for (Uint32 i = 0; i < source.getPropertyCount() && i < readBack.getPropertyCount(); ++i) {
        compareProperty(where + "." + shown(source.getProperty(i).getName()), source.getProperty(i),
                        readBack.getProperty(i));
    }
    expectEqual(where + " methods", std::to_string(source.getMethodCount()), std::to_string(readBack.getMethodCount()));
    for (Uint32 i = 0; i < source.getMethodCount() && i < readBack.getMethodCount(); ++i) {
        compareMethod(where + "." + shown(source.getMethod(i).getName()), source.getMethod(i), readBack.getMethod(i));
    }
}

std::string shown(const CIMConstQualifierDecl& declaration)
{
    return shown(declaration.getName()) + " " + shown(declaration.getValue()) + " [" +
           std::to_string(declaration.getArraySize()) + "] " + base::utf8(declaration.getScope().toString()) + ", " +
           shown(declaration.getFlavor());
}

} // namespace

std::vector<std::string> differences(const CIMConstClass& source, const CIMConstClass& readBack,
                                     const Declarations& declarations)
{
    Comparison comparison(declarations);
    comparison.compareClass(source, readBack);
    return comparison.take();
}

std::vector<std::string> differences(const CIMConstQualifierDecl& source, const CIMConstQualifierDecl& readBack)
{
    if (shown(source) == shown(readBack)) {
        return {};
    }
    return {"qualifier " + shown(source.getName()) + ": " + shown(source) + " in the source, " + shown(readBack) +
            " read back"};
}

} // namespace mofcompare
