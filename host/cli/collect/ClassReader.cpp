// SPDX-License-Identifier: MIT
#include "host/cli/collect/ClassReader.h"

#include "display/PropertyText.h"
#include "host/cli/model/NoContext.h"
#include "host/inmem/TInmemProperty.h"

#include <host/ICIMMethodDecl.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>

#include <set>

namespace vrxhost {

using namespace NKOLVRX20;

namespace {

constexpr int kMaxDepth = 128; // of a chain of superclasses
constexpr unsigned char kDecimal = 10;

std::string TypeText(TCIMValue::TCIMType type)
{
    return std::string(type.GetName()) + (type.IsArray() ? "[]" : "");
}

// A reference, a null one too, points weakly at objects of the plug-in, and even a weak pointer runs the code of the
// library that made it, which is unloaded before the document goes.
TCIMValue Detached(const TCIMValue& value)
{
    if (value.GetType() != TCIMValue::TCIMType::kReference) {
        return value;
    }
    if (value.IsNull()) {
        return TCIMValue(TCIMValue::TCIMType::kString, 0);
    }
    if (!value.IsArray()) {
        return TCIMValue(value.ToString(kDecimal));
    }
    std::vector<TCIMValue> paths;
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
        paths.emplace_back(element.ToString(kDecimal));
    }
    return TCIMValue(TCIMValue::TCIMType::kString, 0, paths);
}

TCIMValue QualifierValue(const ICIMNamedElement& element, const char* name)
{
    const auto qualifier = element.GetQualifier(name, kNoContext);
    return qualifier ? qualifier->GetValue(kNoContext) : TCIMValue();
}

bool IsTrue(const ICIMNamedElement& element, const char* qualifier)
{
    const TCIMValue value = QualifierValue(element, qualifier);
    return value.GetType() == TCIMValue::TCIMType::kBoolean && !value.IsArray() && !value.IsNull() &&
           static_cast<bool>(value);
}

std::string Text(const ICIMNamedElement& element, const char* qualifier)
{
    return QualifierValue(element, qualifier).ToString(kDecimal);
}

std::vector<std::string> Texts(const ICIMNamedElement& element, const char* qualifier)
{
    std::vector<std::string> texts;
    const TCIMValue value = QualifierValue(element, qualifier);
    if (value.IsArray() && !value.IsNull()) {
        for (const TCIMValue& each : static_cast<const std::vector<TCIMValue>&>(value)) {
            texts.push_back(each.ToString(kDecimal));
        }
    }
    return texts;
}

TPropertyDeclRecord ReadProperty(const ICIMPropertyDecl& property, const std::set<std::string>& keys)
{
    TPropertyDeclRecord record;
    record.fName = property.GetName(kNoContext);
    record.fType = TypeText(property.GetType(kNoContext));
    record.fIsKey = keys.count(record.fName) != 0;
    record.fIsCounter = IsTrue(property, "Counter");
    record.fIsVolatile = record.fIsCounter || IsTrue(property, "Gauge") || IsTrue(property, "Volatile");
    record.fUnits = Text(property, "Units");
    record.fPUnit = Text(property, "PUnit");
    record.fValueMap = Texts(property, "ValueMap");
    record.fValues = Texts(property, "Values");
    record.fDescription = Text(property, "Description");
    return record;
}

// A parameter that is marked as neither goes in (DSP0004, 5.6.3).
TParameterRecord ReadParameter(const ICIMParameterDecl& parameter)
{
    const bool isOut = IsTrue(parameter, "Out");
    return {parameter.GetName(kNoContext), TypeText(parameter.GetType(kNoContext)), !isOut || IsTrue(parameter, "In"),
            isOut};
}

TMethodRecord ReadMethod(const ICIMMethodDecl& method)
{
    TMethodRecord record;
    record.fName = method.GetName(kNoContext);
    record.fReturnType = TypeText(method.GetReturnType(kNoContext));
    method.EnumerateParameterDecls(
        [&record](boost::shared_ptr<ICIMParameterDecl> parameter) {
            record.fParameters.push_back(ReadParameter(*parameter));
            return true;
        },
        kNoContext);
    return record;
}

std::set<std::string> KeyNames(const ICIMClass& each)
{
    std::set<std::string> keys;
    each.EnumerateKeyNames(
        [&keys](const std::string* name) {
            keys.insert(*name);
            return true;
        },
        kNoContext);
    return keys;
}

void ReadAncestors(const ICIMClass& from, TClassRecord& into)
{
    auto ancestor = from.GetSuperClass(kNoContext);
    for (int depth = 0; ancestor && !ancestor->IsRootClass(kNoContext) && depth < kMaxDepth; ++depth) {
        into.fAncestors.push_back(ancestor->GetName(kNoContext));
        ancestor = ancestor->GetSuperClass(kNoContext);
    }
}

} // namespace

void ReadDeclarations(ICIMClass& from, TClassRecord& into)
{
    into.fIsAssociation = from.IsAssociation(kNoContext);
    const auto keys = KeyNames(from);
    from.EnumeratePropertyDecls(
        [&](boost::shared_ptr<ICIMPropertyDecl> property) {
            into.fProperties.push_back(ReadProperty(*property, keys));
            return true;
        },
        kNoContext);
    from.EnumerateMethodDecls(
        [&](boost::shared_ptr<ICIMMethodDecl> method) {
            into.fMethods.push_back(ReadMethod(*method));
            return true;
        },
        kNoContext);
    from.EnumerateQualifiers(
        [&](boost::shared_ptr<ICIMQualifier> qualifier) {
            into.fQualifiers.push_back(
                {qualifier->GetName(kNoContext), qualifier->GetValue(kNoContext).ToString(kDecimal)});
            return true;
        },
        kNoContext);
    ReadAncestors(from, into);
}

TInstanceRecord ReadInstance(const ICIMInstance& instance)
{
    TInstanceRecord record;
    record.fPath = instance.BuildPath(kNoContext).GetPath();
    instance.EnumerateProperties(
        [&](boost::shared_ptr<ICIMProperty> property) {
            record.fProperties.push_back(
                {TInmemProperty::NameOf(*property), Detached(property->GetValue(kNoContext)), property->ToString()});
            return true;
        },
        kNoContext);
    return record;
}

TPropertyRecord ReadValue(const std::string& name, const TCIMValue& value, const ICIMNamedElement* declaration)
{
    return {name, Detached(value), ElementText(value, declaration)};
}

} // namespace vrxhost
