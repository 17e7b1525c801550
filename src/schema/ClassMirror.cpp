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

TClassMirror::TClassMirror(TPEGASUSClass& target) : fTarget(target), fNamespace(target.GetOwningNamespace()) {}

void TClassMirror::Mirror(const Pegasus::CIMClass& source)
{
    MirrorQualifiers(source, {fTarget, kClassFailure, fTarget.GetName({})});
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

template <typename TSource> void TClassMirror::MirrorQualifiers(const TSource& source, const TElement& element)
{
    for (Pegasus::Uint32 i = 0; i < source.getQualifierCount(); ++i) {
        Guarded(element.fFailureText, element.fName,
                [&] { MirrorQualifier(source.getQualifier(i), element.fElement); });
    }
}

void TClassMirror::MirrorQualifier(const Pegasus::CIMConstQualifier& source, ICIMNamedElement& element)
{
    const std::string name = NameOf(source);
    const auto declaration = DeclarationOf(source.getName(), name);
    if (!declaration) {
        return;
    }
    const auto qualifier = element.AllocateQualifier(declaration, ValueOf(source, name),
                                                     FlavorFromText(ToStdString(source.getFlavor().toString())), {});
    boost::static_pointer_cast<TPEGASUSQualifier>(qualifier)->SetPropagated(source.getPropagated() != 0);
    element.AddQualifier(qualifier, {});
}

template <typename TSource> TCIMValue TClassMirror::ValueOf(const TSource& source, const std::string& name) const
{
    TCIMValue value;
    if (!source.getValue().isNull()) {
        pegValToVRX(name, source.getValue(), source.getType(), source.isArray(), value, fTarget.shared_from_this());
    }
    return value;
}

boost::shared_ptr<ICIMQualifierDecl> TClassMirror::DeclarationOf(const Pegasus::CIMName& qualifier,
                                                                 const std::string& name)
{
    if (const auto known = fNamespace.FindQualifierDecl(name)) {
        return known;
    }
    return fUnknownQualifiers.count(name) == 0 ? FetchDeclaration(qualifier, name) : nullptr;
}

boost::shared_ptr<ICIMQualifierDecl> TClassMirror::FetchDeclaration(const Pegasus::CIMName& qualifier,
                                                                    const std::string& name)
{
    try {
        const auto source = fNamespace.ConnectedClient().getQualifier(fTarget.GetPegasusNSP(), qualifier);
        const TCIMValue defaultValue = source.getValue().isNull()
                                           ? TCIMValue(pegTypeToVRXType(source.getType(), source.isArray()), 0)
                                           : ValueOf(source, name);
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
        fUnknownQualifiers.insert(name); // asked for once more by the next class, when the server may answer
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
    const auto declaration = fTarget.AllocatePropertyDecl(name, TCIMValue(type, 0), {});
    const TCIMValue defaultValue = ValueOf(source, name);
    // A scalar that lacks a default keeps the typed null. An array's default is always set: the empty array that the
    // declaration starts with would be a value.
    if (type.IsArray() || !defaultValue.IsNull()) {
        declaration->SetDefaultValue(defaultValue, {});
    }
    MirrorQualifiers(source, {*declaration, kPropertyFailure, name});
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
    MirrorQualifiers(source, {*method, kMethodFailure, name});
    for (Pegasus::Uint32 i = 0; i < source.getParameterCount(); ++i) {
        Guarded(kMethodFailure, name, [&] { MirrorParameter(source.getParameter(i), *method); });
    }
    fTarget.EnterMethodDecl(method); // AddMethodDecl, the host's slot, does nothing
}

void TClassMirror::MirrorParameter(const Pegasus::CIMConstParameter& source, TPEGASUSMethodDecl& method)
{
    const auto parameter =
        method.AllocateParameterDecl(NameOf(source), pegTypeToVRXType(source.getType(), source.isArray()), {});
    MirrorQualifiers(source, {*parameter, kMethodFailure, method.GetName({})});
    parameter->AddToMethod({});
}

} // namespace NKOLVRX20
