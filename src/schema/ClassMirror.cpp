// SPDX-License-Identifier: MIT
#include "src/schema/ClassMirror.h"

#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/instance/ValueConversion.h"
#include "src/schema/DeclarationAttributes.h"
#include "src/schema/TPEGASUSClass.h"
#include "src/schema/TPEGASUSMethodDecl.h"
#include "src/schema/TPEGASUSParameterDecl.h"
#include "src/schema/TPEGASUSPropertyDecl.h"
#include "src/schema/TPEGASUSQualifierDecl.h"

#include <boost/make_shared.hpp>

#include <algorithm>
#include <utility>

namespace NKOLVRX20 {

namespace {

using TType = TCIMValue::TCIMType;

constexpr char kQualifierFailure[] = "TPEGASUSClass::Initialize - Unable to retrieve qualifier: ";
constexpr char kClassFailure[] = "- error when Adding Qualifiers for class: ";
constexpr char kPropertyFailure[] = " - error when Adding Qualifiers for property: ";
constexpr char kMethodFailure[] = " - error when Adding Qualifiers for method: ";
constexpr char kDetail[] = "\tdetail: ";

template <typename TElement> std::string NameOf(const TElement& element)
{
    return ToStdString(element.getName().getString());
}

// Runs the step for one element of the class, so that its failure costs that element alone.
template <typename TStep> void Guarded(const char* failureText, const std::string& name, TStep step)
{
    try {
        step();
    } catch (...) {
        LogFailure(failureText, name, kDetail, DescribeCurrentException());
    }
}

} // namespace

TClassMirror::TClassMirror(TPEGASUSClass& target)
    : fTarget(target), fNamespace(target.GetOwningNamespace()), fValues(fNamespace.GetQualifierValues())
{
}

void TClassMirror::Mirror(const Pegasus::CIMClass& source)
{
    MirrorQualifiers(source, fTarget, fValues.On(""), kClassFailure, fTarget.GetName({}));
    for (Pegasus::Uint32 i = 0; i < source.getPropertyCount(); ++i) {
        const Pegasus::CIMConstProperty property = source.getProperty(i);
        const std::string name = NameOf(property);
        Guarded(kPropertyFailure, name, [&] { MirrorProperty(property, name); });
    }
    for (Pegasus::Uint32 i = 0; i < source.getMethodCount(); ++i) {
        const Pegasus::CIMConstMethod method = source.getMethod(i);
        const std::string name = NameOf(method);
        Guarded(kMethodFailure, name, [&] { MirrorMethod(method, name); });
    }
}

template <typename TSource, typename TElement>
void TClassMirror::MirrorQualifiers(const TSource& source, TElement& element, TQualifierValues::TElement& values,
                                    const char* failureText, const std::string& name)
{
    for (Pegasus::Uint32 i = 0; i < source.getQualifierCount(); ++i) {
        Guarded(failureText, name, [&] { MirrorQualifier(source.getQualifier(i), element, values); });
    }
}

template <typename TElement>
void TClassMirror::MirrorQualifier(const Pegasus::CIMConstQualifier& source, TElement& element,
                                   TQualifierValues::TElement& values)
{
    TQualifierKind& kind = KindOf(source.getName());
    if (!kind.fDeclaration) {
        return;
    }
    if (!kind.fServedFlavor.equal(source.getFlavor())) {
        kind.fServedFlavor = source.getFlavor();
        kind.fFlavor = FlavorFromText(ToStdString(kind.fServedFlavor.toString()));
    }
    const auto qualifier = boost::make_shared<TPEGASUSQualifier>(element.shared_from_this(), kind.fDeclaration,
                                                                 SharedValueOf(source, values), kind.fFlavor);
    qualifier->SetPropagated(source.getPropagated() != 0);
    element.EnterQualifier(kind.fKey, qualifier);
}

template <typename TSource> TCIMValue TClassMirror::ValueOf(const TSource& source) const
{
    TCIMValue value;
    if (!source.getValue().isNull()) {
        ToHostValue(source.getValue(), source.getType(), source.isArray(), &fTarget, value);
    }
    return value;
}

TCIMValue TClassMirror::SharedValueOf(const Pegasus::CIMConstQualifier& source,
                                      TQualifierValues::TElement& values) const
{
    TConvertedValue& last = values.Of(source.getName());
    if (!last.IsOf(source.getValue())) {
        TCIMValue value = ValueOf(source);
        last.Keep(source.getValue(), source.getType(), value);
        return value;
    }
    return last.Get();
}

// Throws: TVRXException 25, after a log line, for an invalid name.
TClassMirror::TQualifierKind& TClassMirror::KindOf(const Pegasus::CIMName& qualifier)
{
    const Pegasus::String& served = qualifier.getString();
    // Names of one answer are most often the very same text.
    auto known = std::find_if(fKinds.begin(), fKinds.end(), [units = served.getChar16Data()](const auto& kind) {
        return kind.fServed.getChar16Data() == units;
    });
    if (known == fKinds.end()) {
        known = std::find_if(fKinds.begin(), fKinds.end(),
                             [&](const TQualifierKind& kind) { return kind.fServed == served; });
    }
    if (known != fKinds.end()) {
        return *known;
    }
    const std::string name = ToStdString(served);
    TQualifierKind kind;
    kind.fServed = served;
    kind.fDeclaration = fNamespace.FindQualifierDecl(name);
    if (!kind.fDeclaration) {
        kind.fDeclaration = FetchDeclaration(qualifier, name);
    }
    if (kind.fDeclaration) {
        kind.fKey = NormalizedName(kind.fDeclaration->GetName({}));
    }
    fKinds.push_back(std::move(kind));
    return fKinds.back();
}

// Returns: null after a failure, which is logged. The next class asks again, when the server may answer.
boost::shared_ptr<ICIMQualifierDecl> TClassMirror::FetchDeclaration(const Pegasus::CIMName& qualifier,
                                                                    const std::string& name) const
{
    try {
        const auto source = fNamespace.ConnectedClient().getQualifier(fTarget.GetPegasusNSP(), qualifier);
        const TCIMValue defaultValue = source.getValue().isNull()
                                           ? TCIMValue(pegTypeToVRXType(source.getType(), source.isArray()), 0)
                                           : ValueOf(source);
        auto declaration = fNamespace.AllocateQualifierDecl(NameOf(source), defaultValue,
                                                            ScopeFromText(ToStdString(source.getScope().toString())),
                                                            FlavorFromText(ToStdString(source.getFlavor().toString())));
        if (source.isArray() && source.getValue().isNull()) {
            declaration->SetDefaultValue(TCIMValue(), {}); // the empty array has given the type; it is not the default
        }
        fNamespace.AddQualifierDecl(boost::dynamic_pointer_cast<TPEGASUSQualifierDecl>(declaration));
        return declaration;
    } catch (...) {
        LogFailure(kQualifierFailure, name, kDetail, DescribeCurrentException());
        return nullptr;
    }
}

// A type that the host lacks a code for, an embedded object, is declared as text. Such a property is served that way,
// and many DMTF classes have one: the line is progress.
TType TClassMirror::PropertyType(const Pegasus::CIMConstProperty& source, const std::string& name) const
{
    const TType type = pegTypeToVRXType(source.getType(), source.isArray());
    if (type.GetElementType() != TType::kNone) {
        return type;
    }
    LogProgress("Not supported type of property ", name, " in class ", fTarget.GetName({}), ": ",
                static_cast<int>(source.getType()), ", default to string.");
    return source.isArray() ? TType::kStringArray : TType::kString;
}

void TClassMirror::MirrorProperty(const Pegasus::CIMConstProperty& source, const std::string& name)
{
    const TType type = PropertyType(source, name);
    const auto declaration =
        boost::static_pointer_cast<TPEGASUSPropertyDecl>(fTarget.AllocatePropertyDecl(name, TCIMValue(type, 0), {}));
    const TCIMValue defaultValue = ValueOf(source);
    // A scalar that lacks a default keeps the typed null. An array's default is always set: the empty array that the
    // declaration starts with would be a value.
    if (type.IsArray() || !defaultValue.IsNull()) {
        declaration->SetDefaultValue(defaultValue, {});
    }
    MirrorQualifiers(source, *declaration, fValues.On(name), kPropertyFailure, name);
    // After its qualifiers, because they decide how the class takes the declaration.
    if (declaration->GetQualifier(kOverrideQualifier, {})) {
        fTarget.AdoptPropertyDecl(name);
    }
    fTarget.AddPropertyDecl(declaration);
    if (!defaultValue.IsNull()) {
        fTarget.EnterProperty(declaration, defaultValue, source.getPropagated() != 0);
    }
}

void TClassMirror::MirrorMethod(const Pegasus::CIMConstMethod& source, const std::string& name)
{
    const auto method = boost::dynamic_pointer_cast<TPEGASUSMethodDecl>(
        fTarget.AllocateMethodDecl(name, pegTypeToVRXType(source.getType(), false), {}));
    MirrorQualifiers(source, *method, fValues.On(name), kMethodFailure, name);
    for (Pegasus::Uint32 i = 0; i < source.getParameterCount(); ++i) {
        Guarded(kMethodFailure, name, [&] { MirrorParameter(source.getParameter(i), *method); });
    }
    fTarget.EnterMethodDecl(method); // AddMethodDecl, the host's slot, does nothing
}

void TClassMirror::MirrorParameter(const Pegasus::CIMConstParameter& source, TPEGASUSMethodDecl& method)
{
    const std::string name = NameOf(source);
    const std::string methodName = method.GetName({});
    const auto parameter = boost::static_pointer_cast<TPEGASUSParameterDecl>(
        method.AllocateParameterDecl(name, pegTypeToVRXType(source.getType(), source.isArray()), {}));
    MirrorQualifiers(source, *parameter, fValues.On(methodName + '.' + name), kMethodFailure, methodName);
    parameter->AddToMethod({});
}

} // namespace NKOLVRX20
