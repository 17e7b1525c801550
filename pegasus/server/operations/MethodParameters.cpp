// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/MethodParameters.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/common/EmbeddedKind.h"
#include "pegasus/common/ObjectReps.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server {

namespace {

// A name from a client may be as long as its request.
constexpr std::size_t kMaxLoggedNameBytes = 128;

bool isEmbedded(CIMType type)
{
    return type == CIMTYPE_OBJECT || type == CIMTYPE_INSTANCE;
}

// The type that values of the parameter have: an embedded object is declared as a string with a qualifier.
CIMType valueType(const CIMConstParameter& declaration)
{
    switch (embeddedKind(declaration.getType(), ObjectAccess::rep(declaration).fQualifiers)) {
    case EmbeddedKind::kInstance:
        return CIMTYPE_INSTANCE;
    case EmbeddedKind::kObject:
        return CIMTYPE_OBJECT;
    default:
        return declaration.getType();
    }
}

std::string typeText(CIMType type, bool isArray)
{
    return std::string(cimTypeToString(type)) + (isArray ? "[]" : "");
}

// An untyped value is a text, a reference or an embedded object by the element that it came in.
bool canBeReadAs(CIMType sent, CIMType declared)
{
    return sent == CIMTYPE_STRING || sent == declared || (isEmbedded(sent) && isEmbedded(declared));
}

CIMValue readPaths(const CIMValue& texts)
{
    if (!texts.isArray()) {
        return ValueAccess::make(CIMObjectPath(ValueAccess::held<String>(texts)));
    }
    Array<CIMObjectPath> paths;
    const auto& list = ValueAccess::held<Array<String>>(texts);
    for (Uint32 i = 0; i < list.size(); ++i) {
        paths.append(CIMObjectPath(list[i]));
    }
    return ValueAccess::make(std::move(paths));
}

// Reads the value again, by the rules for values that come with a type.
// Throws: Exception when the conversion fails.
CIMValue readAs(const CIMValue& sent, CIMType type)
{
    if (sent.getType() == type) {
        return sent;
    }
    if (type == CIMTYPE_REFERENCE) {
        return readPaths(sent);
    }
    std::string element;
    wire::appendValue(element, sent);
    wire::XmlDocument document;
    wire::ElementDecoder decoder;
    return decoder.decodeValue(document.parseFragment(element), type);
}

} // namespace

void ParameterWarnings::give(const std::string& subject, const std::string& text)
{
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        if (fSubjects.size() == kMaxWarnings || !fSubjects.insert(base::foldCase(subject)).second) {
            return;
        }
    }
    Log::write(LogLevel::kWarning, text);
}

MethodDeclaration::MethodDeclaration(const CIMConstClass& cimClass, const CIMName& method)
    : fName(base::utf8(cimClass.getClassName()) + "." + base::utf8(method)), fMethodName(method)
{
    const Uint32 index = cimClass.findMethod(method);
    if (index != PEG_NOT_FOUND) {
        fMethod = cimClass.getMethod(index);
    }
}

// Returns: an uninitialized handle for an undeclared parameter.
CIMConstParameter MethodDeclaration::declared(const CIMParamValue& sent) const
{
    const Uint32 index = fMethod.findParameter(CIMName(sent.getParameterName()));
    return index == PEG_NOT_FOUND ? CIMConstParameter() : fMethod.getParameter(index);
}

CIMParamValue MethodDeclaration::withType(const CIMParamValue& sent, const CIMConstParameter& declaration) const
{
    const CIMType type = valueType(declaration);
    const CIMValue value = sent.getValue();
    if (value.isNull()) {
        return {sent.getParameterName(), CIMValue(type, declaration.isArray()), true};
    }
    const std::string subject = fName + ": parameter \"" + base::utf8(declaration.getName()) + "\"";
    if (value.isArray() != declaration.isArray() || !canBeReadAs(value.getType(), type)) {
        const std::string text = subject + " is declared " + typeText(type, declaration.isArray()) +
                                 ", but was sent as " + typeText(value.getType(), value.isArray());
        throw CIMException(CIM_ERR_TYPE_MISMATCH, base::fromUtf8(text));
    }
    try {
        return {sent.getParameterName(), readAs(value, type), true};
    } catch (const Exception&) {
        const std::string text = subject + ": the value does not convert to " + typeText(type, declaration.isArray());
        throw CIMException(CIM_ERR_INVALID_PARAMETER, base::fromUtf8(text));
    }
}

Array<CIMParamValue> MethodDeclaration::withTypes(const Array<CIMParamValue>& sent) const
{
    Array<CIMParamValue> result;
    result.reserveCapacity(sent.size());
    for (Uint32 i = 0; i < sent.size(); ++i) {
        const CIMParamValue& parameter = sent[i];
        if (!parameter.isTyped() && fMethod.isUninitialized()) {
            throw CIMException(CIM_ERR_METHOD_NOT_FOUND, fMethodName.getString());
        }
        const CIMConstParameter declaration = parameter.isTyped() ? CIMConstParameter() : declared(parameter);
        result.append(declaration.isUninitialized() ? parameter : withType(parameter, declaration));
    }
    return result;
}

// Returns: what the declaration says otherwise; empty when it agrees.
std::string MethodDeclaration::difference(const CIMParamValue& sent) const
{
    const CIMConstParameter declaration = declared(sent);
    if (declaration.isUninitialized()) {
        return "is not declared";
    }
    const CIMValue value = sent.getValue();
    const CIMType type = valueType(declaration);
    const bool isOfType = value.getType() == type || (type == CIMTYPE_OBJECT && value.getType() == CIMTYPE_INSTANCE);
    // A null travels in the same form for scalars and arrays.
    const bool isOfForm = value.isNull() || value.isArray() == declaration.isArray();
    if (!sent.isTyped() || (isOfType && isOfForm)) {
        return {};
    }
    return "is declared " + typeText(type, declaration.isArray()) + ", but was sent as " +
           typeText(value.getType(), value.isArray());
}

void MethodDeclaration::warnOfDifferences(const Array<CIMParamValue>& sent, ParameterWarnings& warnings) const
{
    if (fMethod.isUninitialized()) {
        return; // the provider answers whether it has such a method
    }
    for (Uint32 i = 0; i < sent.size(); ++i) {
        const std::string text = difference(sent[i]);
        if (!text.empty()) {
            const std::string name = base::utf8(sent[i].getParameterName()).substr(0, kMaxLoggedNameBytes);
            const std::string subject = fName + ": parameter \"" + name + "\"";
            warnings.give(subject, subject + " " + text + "; the provider gets it as sent");
        }
    }
}

} // namespace Pegasus::server
