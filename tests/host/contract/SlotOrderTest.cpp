// SPDX-License-Identifier: MIT
// The binary order of every host interface. A plug-in and a host that were built apart meet in the slots of the virtual
// tables, so the tables here are written out by hand; a declaration that moves in a header fails its row.
#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMNamespace.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>
#include <host/ILogger.h>
#include <host/INamespaceProvider.h>
#include <host/INamespaceProviderManager.h>
#include <host/IProvider.h>
#include <host/TXmlParser.h>

#include <gtest/gtest.h>

#include <cstddef>
#include <cstring>
#include <string>
#include <vector>

namespace NKOLVRX20 {
namespace {

// The pair of destructors comes first in every table.
constexpr std::size_t kFirstSlot = 2;

struct TOperation
{
    const char* fName;
    std::size_t fSlot;
};

// In the Itanium C++ ABI a pointer to a virtual member function holds 1 plus the byte offset of its slot.
template <typename Function> std::size_t SlotOf(Function function)
{
    struct
    {
        std::size_t fPointer;
        std::ptrdiff_t fAdjustment;
    } raw;
    static_assert(sizeof function == sizeof raw, "Itanium C++ ABI");
    std::memcpy(&raw, &function, sizeof raw);
    return raw.fPointer % 2 == 1 ? (raw.fPointer - 1) / sizeof(void*) : std::size_t(-1);
}

void ExpectOrder(const std::vector<TOperation>& operations)
{
    for (std::size_t i = 0; i < operations.size(); ++i) {
        EXPECT_EQ(operations[i].fSlot, kFirstSlot + i) << operations[i].fName;
    }
}

#define OP(Class, Name)                                                                                                \
    {                                                                                                                  \
        #Name, SlotOf(&Class::Name)                                                                                    \
    }
#define OVERLOAD(Class, Name, Result, Signature)                                                                       \
    {                                                                                                                  \
        #Name #Signature, SlotOf(static_cast<Result(Class::*) Signature>(&Class::Name))                                \
    }

using TQualifier = boost::shared_ptr<ICIMQualifier>;
using TConstQualifierDecl = boost::shared_ptr<const ICIMQualifierDecl>;
using EFlavor = ICIMQualifierDecl::EFlavor;

TEST(SlotOrder, NamespaceProvider)
{
    ExpectOrder({OP(INamespaceProvider, GetName), OP(INamespaceProvider, AllocateNamespace),
                 OP(INamespaceProvider, GetType), OP(INamespaceProvider, IsIndicationsSupported)});
}

TEST(SlotOrder, Namespace)
{
    ExpectOrder({OP(ICIMNamespace, GetNamespaceProvider), OP(ICIMNamespace, SetUpcallNamespace),
                 OP(ICIMNamespace, AddUnderlyingNamespace), OP(ICIMNamespace, AllocateClass),
                 OP(ICIMNamespace, GetClass), OP(ICIMNamespace, EnumerateRootClasses),
                 OP(ICIMNamespace, EnumerateProviders), OP(ICIMNamespace, AllocateQualifierDecl),
                 OP(ICIMNamespace, GetQualifierDecl), OP(ICIMNamespace, EnumerateQualifierDecls),
                 OP(ICIMNamespace, Subscribe), OP(ICIMNamespace, GetInstance), OP(ICIMNamespace, DeleteInstance),
                 OP(ICIMNamespace, ModifyInstance), OP(ICIMNamespace, ExecuteQuery),
                 OP(ICIMNamespace, ClearInstances)});
}

TEST(SlotOrder, Provider)
{
    ExpectOrder({OP(IProvider, GetName), OP(IProvider, GetModuleName), OP(IProvider, GetDescription),
                 OP(IProvider, GetNamespace), OP(IProvider, EnumerateClassesProvided), OP(IProvider, operator=)});
}

// The qualifier block in the order of its own interface, which is also how the three declarations begin.
template <typename Element> std::vector<TOperation> NamedElementBlock()
{
    return {OP(Element, AddQualifier),
            OVERLOAD(Element, AllocateQualifier, TQualifier, (TConstQualifierDecl, TCIMValue, TCIMContext)),
            OVERLOAD(Element, AllocateQualifier, TQualifier, (TConstQualifierDecl, TCIMValue, EFlavor, TCIMContext)),
            OVERLOAD(Element, GetQualifier, TQualifier, (const std::string&, TCIMContext) const),
            OP(Element, EnumerateQualifiers),
            OVERLOAD(Element, GetQualifier, TQualifier, (const std::string&, bool&, TCIMContext) const)};
}

template <typename Element> void ExpectOrderAfterBlock(const std::vector<TOperation>& operations)
{
    std::vector<TOperation> all = NamedElementBlock<Element>();
    all.insert(all.end(), operations.begin(), operations.end());
    ExpectOrder(all);
}

TEST(SlotOrder, NamedElement)
{
    ExpectOrder(NamedElementBlock<ICIMNamedElement>());
}

TEST(SlotOrder, Class)
{
    ExpectOrder(
        {OP(ICIMClass, Validate),
         OP(ICIMClass, AddToNamespace),
         OP(ICIMClass, RemoveFromNamespace),
         OP(ICIMClass, ModifyClass),
         OP(ICIMClass, GetName),
         OP(ICIMClass, GetNamespace),
         OP(ICIMClass, IsAssociation),
         OP(ICIMClass, IsAbstract),
         OP(ICIMClass, IsRootClass),
         OP(ICIMClass, GetSuperClass),
         OP(ICIMClass, EnumerateSubClasses),
         OP(ICIMClass, IsSubclassOf),
         OP(ICIMClass, EnumerateAssociatedClasses),
         OP(ICIMClass, EnumerateAssociationClasses),
         OP(ICIMClass, EnumerateKeyNames),
         OP(ICIMClass, AllocatePropertyDecl),
         OP(ICIMClass, GetPropertyDecl),
         OP(ICIMClass, EnumeratePropertyDecls),
         OP(ICIMClass, GetProperty),
         OP(ICIMClass, SetPropertyValue),
         OP(ICIMClass, EnumerateStaticProperties),
         OP(ICIMClass, AllocateInstance),
         OP(ICIMClass, EnumerateInstances),
         OP(ICIMClass, AllocateMethodDecl),
         OP(ICIMClass, GetMethodDecl),
         OP(ICIMClass, EnumerateMethodDecls),
         OVERLOAD(ICIMClass, InvokeMethod, TCIMValue, (const std::string&, TCIMContext&, TCIMContext)),
         OP(ICIMClass, operator==),
         OP(ICIMClass, operator<),
         OP(ICIMClass, operator=),
         OP(ICIMClass, hasCollected),
         OP(ICIMClass, SetCollected),
         OP(ICIMClass, AddChildClass),
         OP(ICIMClass, RemoveChildClass),
         OP(ICIMClass, AddInstance),
         OP(ICIMClass, RemoveInstance),
         OP(ICIMClass, AddAssociationClass),
         OP(ICIMClass, RemoveAssociationClass),
         OP(ICIMClass, AddPropertyDecl),
         OP(ICIMClass, RemovePropertyDecl),
         OP(ICIMClass, AddMethodDecl),
         OP(ICIMClass, RemoveMethodDecl),
         OP(ICIMClass, AddQualifier),
         OVERLOAD(ICIMClass, AllocateQualifier, TQualifier, (TConstQualifierDecl, TCIMValue, EFlavor, TCIMContext)),
         OVERLOAD(ICIMClass, AllocateQualifier, TQualifier, (TConstQualifierDecl, TCIMValue, TCIMContext)),
         OVERLOAD(ICIMClass, GetQualifier, TQualifier, (const std::string&, TCIMContext) const),
         OVERLOAD(ICIMClass, GetQualifier, TQualifier, (const std::string&, bool&, TCIMContext) const),
         OP(ICIMClass, EnumerateQualifiers),
         OVERLOAD(ICIMClass, InvokeMethod, TCIMValue,
                  (const TCIMReference&, const std::string&, const TCIMContext&, TCIMContext&, TCIMContext)),
         OP(ICIMClass, ClearInstances)});
}

TEST(SlotOrder, Instance)
{
    ExpectOrder({OP(ICIMInstance, Validate), OP(ICIMInstance, AddToNamespace), OP(ICIMInstance, ModifyInstance),
                 OP(ICIMInstance, Delete), OP(ICIMInstance, GetReference), OP(ICIMInstance, BuildPath),
                 OP(ICIMInstance, GetClass), OP(ICIMInstance, GetPegasusNSPStr),
                 OP(ICIMInstance, EnumerateAssociatedInstances), OP(ICIMInstance, EnumerateAssociationInstances),
                 OP(ICIMInstance, GetProperty), OP(ICIMInstance, SetPropertyValue),
                 OP(ICIMInstance, EnumerateProperties), OP(ICIMInstance, InvokeMethod), OP(ICIMInstance, operator==),
                 OP(ICIMInstance, operator<), OP(ICIMInstance, operator=)});
}

TEST(SlotOrder, Property)
{
    ExpectOrder({OP(ICIMProperty, GetType), OP(ICIMProperty, IsArray), OP(ICIMProperty, IsDefaultValue),
                 OP(ICIMProperty, GetValue), OP(ICIMProperty, SetValue), OP(ICIMProperty, GetPropagated),
                 OP(ICIMProperty, GetDeclaration), OP(ICIMProperty, operator==), OP(ICIMProperty, operator<),
                 OP(ICIMProperty, operator=), OP(ICIMProperty, GetPrevValue),
                 OVERLOAD(ICIMProperty, SetPrevValue, void, (TCIMValue)),
                 OVERLOAD(ICIMProperty, SetPrevValue, void, ()), OP(ICIMProperty, IsPrevValueDifferent),
                 OP(ICIMProperty, ToString), OP(ICIMProperty, PrevValueToString), OP(ICIMProperty, ToStringVector)});
}

TEST(SlotOrder, PropertyDecl)
{
    ExpectOrderAfterBlock<ICIMPropertyDecl>(
        {OP(ICIMPropertyDecl, Validate), OP(ICIMPropertyDecl, AddToClass), OP(ICIMPropertyDecl, RemoveFromClass),
         OP(ICIMPropertyDecl, GetName), OP(ICIMPropertyDecl, GetClass), OP(ICIMPropertyDecl, GetType),
         OP(ICIMPropertyDecl, IsArray), OP(ICIMPropertyDecl, GetDefaultValue), OP(ICIMPropertyDecl, SetDefaultValue),
         OP(ICIMPropertyDecl, operator==), OP(ICIMPropertyDecl, operator<), OP(ICIMPropertyDecl, operator=)});
}

TEST(SlotOrder, MethodDecl)
{
    ExpectOrderAfterBlock<ICIMMethodDecl>(
        {OP(ICIMMethodDecl, Validate), OP(ICIMMethodDecl, AddToClass), OP(ICIMMethodDecl, GetName),
         OP(ICIMMethodDecl, GetClass), OP(ICIMMethodDecl, GetReturnType), OP(ICIMMethodDecl, AllocateParameterDecl),
         OP(ICIMMethodDecl, GetParameterDecl), OP(ICIMMethodDecl, EnumerateParameterDecls),
         OP(ICIMMethodDecl, operator==), OP(ICIMMethodDecl, operator<), OP(ICIMMethodDecl, operator=)});
}

TEST(SlotOrder, ParameterDecl)
{
    ExpectOrderAfterBlock<ICIMParameterDecl>(
        {OP(ICIMParameterDecl, Validate), OP(ICIMParameterDecl, AddToMethod), OP(ICIMParameterDecl, GetName),
         OP(ICIMParameterDecl, GetMethodDecl), OP(ICIMParameterDecl, GetType), OP(ICIMParameterDecl, IsArray),
         OP(ICIMParameterDecl, operator==), OP(ICIMParameterDecl, operator<), OP(ICIMParameterDecl, operator=)});
}

TEST(SlotOrder, Qualifier)
{
    ExpectOrder({OP(ICIMQualifier, Validate), OP(ICIMQualifier, AddToClassOrProperty),
                 OP(ICIMQualifier, RemoveFromClassOrProperty), OP(ICIMQualifier, GetName),
                 OP(ICIMQualifier, GetClassOrProperty), OP(ICIMQualifier, GetType), OP(ICIMQualifier, IsArray),
                 OP(ICIMQualifier, GetDeclaration), OP(ICIMQualifier, GetValue), OP(ICIMQualifier, SetValue),
                 OP(ICIMQualifier, SetFlavor), OP(ICIMQualifier, UnsetFlavor), OP(ICIMQualifier, GetFlavor),
                 OP(ICIMQualifier, operator==), OP(ICIMQualifier, operator<), OP(ICIMQualifier, GetPropagated),
                 OP(ICIMQualifier, operator=)});
}

TEST(SlotOrder, QualifierDecl)
{
    ExpectOrder({OP(ICIMQualifierDecl, Validate), OP(ICIMQualifierDecl, AddToNamespace),
                 OP(ICIMQualifierDecl, RemoveQualifierDecl), OP(ICIMQualifierDecl, GetName),
                 OP(ICIMQualifierDecl, GetNamespace), OP(ICIMQualifierDecl, GetType), OP(ICIMQualifierDecl, IsArray),
                 OP(ICIMQualifierDecl, GetDefaultValue), OP(ICIMQualifierDecl, SetDefaultValue),
                 OP(ICIMQualifierDecl, GetScope), OP(ICIMQualifierDecl, SetFlavor), OP(ICIMQualifierDecl, UnsetFlavor),
                 OP(ICIMQualifierDecl, GetFlavor), OP(ICIMQualifierDecl, operator==), OP(ICIMQualifierDecl, operator<),
                 OP(ICIMQualifierDecl, operator=)});
}

// The parser's own steps are for derived classes alone.
class TOpenXmlParser : public TXmlParser
{
  public:
    static std::vector<TOperation> Operations()
    {
        return {
            OP(TXmlParser, StartElement),  OP(TXmlParser, EndElement),        OP(TXmlParser, processingInstruction),
            OP(TXmlParser, characters),    OP(TXmlParser, notationDecl),      OP(TXmlParser, FatalError),
            OP(TOpenXmlParser, ParseJSSP), OP(TOpenXmlParser, ParseCharData), OP(TOpenXmlParser, GetAttributeNValue)};
    }
};

TEST(SlotOrder, XmlParser)
{
    ExpectOrder(TOpenXmlParser::Operations());
}

TEST(SlotOrder, Services)
{
    ExpectOrder({OP(ILogger, Log)});
    ExpectOrder({OP(INamespaceProviderManager, RegisterNamespaceProvider)});
}

} // namespace
} // namespace NKOLVRX20
