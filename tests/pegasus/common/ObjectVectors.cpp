// SPDX-License-Identifier: MIT
#include "tests/pegasus/common/VectorTable.h"

#include <Pegasus/Client/CIMClient.h>

#include <memory>

#include <cxxabi.h>

using namespace Pegasus;

namespace test {
namespace {

constexpr const char* kDone = "no exception";

// A call on a default-constructed object.
template <typename T, typename Call> Evaluator on(Call call)
{
    return [call](const Vector&) {
        T object;
        call(object);
        return kDone;
    };
}

CIMProperty property(const char* name = "P")
{
    return CIMProperty(name, CIMValue(Uint8(1)));
}

CIMClass classWith(const CIMQualifier& qualifier)
{
    CIMClass cimClass("Foo");
    cimClass.addQualifier(qualifier);
    return cimClass;
}

CIMClass keyedClass()
{
    CIMProperty key("K", CIMValue(CIMTYPE_STRING, false));
    key.addQualifier(CIMQualifier("Key", CIMValue(true)));
    CIMClass cimClass("Foo");
    cimClass.addProperty(key);
    return cimClass;
}

json pathOf(CIMInstance instance)
{
    return utf8(instance.buildPath(keyedClass()).toString());
}

CIMInstance withKey(const CIMValue& value)
{
    CIMInstance instance("Foo");
    instance.addProperty(CIMProperty("K", value));
    return instance;
}

std::string typeName(const std::type_info& type)
{
    const std::unique_ptr<char, decltype(&std::free)> name(abi::__cxa_demangle(type.name(), nullptr, nullptr, nullptr),
                                                           &std::free);
    return name.get();
}

void addUninitialized(VectorTable& table)
{
    table["CIMClass().getClassName()"] = on<CIMClass>([](auto& x) { x.getClassName(); });
    table["CIMClass().getSuperClassName()"] = on<CIMClass>([](auto& x) { x.getSuperClassName(); });
    table["CIMClass().getQualifierCount()"] = on<CIMClass>([](auto& x) { x.getQualifierCount(); });
    table["CIMClass().findProperty(CIMName(\"a\"))"] = on<CIMClass>([](auto& x) { x.findProperty("a"); });
    table["CIMClass().isAssociation()"] = on<CIMClass>([](auto& x) { x.isAssociation(); });
    table["CIMClass().isAbstract()"] = on<CIMClass>([](auto& x) { x.isAbstract(); });
    table["CIMClass().isUninitialized()"] = on<CIMClass>([](auto& x) { x.isUninitialized(); });
    table["CIMClass().hasKeys()"] = on<CIMClass>([](auto& x) { x.hasKeys(); });
    table["CIMInstance().getClassName()"] = on<CIMInstance>([](auto& x) { x.getClassName(); });
    table["CIMInstance().getPropertyCount()"] = on<CIMInstance>([](auto& x) { x.getPropertyCount(); });
    table["CIMInstance().getQualifierCount()"] = on<CIMInstance>([](auto& x) { x.getQualifierCount(); });
    table["CIMInstance().isUninitialized()"] = on<CIMInstance>([](auto& x) { x.isUninitialized(); });
    table["CIMInstance().setPath(CIMObjectPath())"] = on<CIMInstance>([](auto& x) { x.setPath(CIMObjectPath()); });
    table["CIMObject().getClassName()"] = on<CIMObject>([](auto& x) { x.getClassName(); });
    table["CIMObject().isClass()"] = on<CIMObject>([](auto& x) { x.isClass(); });
    table["CIMObject().isInstance()"] = on<CIMObject>([](auto& x) { x.isInstance(); });
    table["CIMObject().toString()"] = on<CIMObject>([](auto& x) { x.toString(); });
    table["CIMProperty().getName()"] = on<CIMProperty>([](auto& x) { x.getName(); });
    table["CIMProperty().getValue()"] = on<CIMProperty>([](auto& x) { x.getValue(); });
    table["CIMProperty().getType()"] = on<CIMProperty>([](auto& x) { x.getType(); });
    table["CIMProperty().isArray()"] = on<CIMProperty>([](auto& x) { x.isArray(); });
    table["CIMProperty().setValue(CIMValue(Uint8(1)))"] =
        on<CIMProperty>([](auto& x) { x.setValue(CIMValue(Uint8(1))); });
    table["CIMMethod().getName()"] = on<CIMMethod>([](auto& x) { x.getName(); });
    table["CIMMethod().getType()"] = on<CIMMethod>([](auto& x) { x.getType(); });
    table["CIMMethod().getParameterCount()"] = on<CIMMethod>([](auto& x) { x.getParameterCount(); });
    table["CIMMethod().isUninitialized()"] = on<CIMMethod>([](auto& x) { x.isUninitialized(); });
    table["CIMParameter().getName()"] = on<CIMParameter>([](auto& x) { x.getName(); });
    table["CIMParameter().isArray()"] = on<CIMParameter>([](auto& x) { x.isArray(); });
    table["CIMParameter().isUninitialized()"] = on<CIMParameter>([](auto& x) { x.isUninitialized(); });
    table["CIMQualifier().getName()"] = on<CIMQualifier>([](auto& x) { x.getName(); });
    table["CIMQualifier().getValue()"] = on<CIMQualifier>([](auto& x) { x.getValue(); });
    table["CIMQualifier().getFlavor()"] = on<CIMQualifier>([](auto& x) { x.getFlavor(); });
    table["CIMQualifier().isUninitialized()"] = on<CIMQualifier>([](auto& x) { x.isUninitialized(); });
    table["CIMQualifierDecl().getName()"] = on<CIMQualifierDecl>([](auto& x) { x.getName(); });
    table["CIMQualifierDecl().getValue()"] = on<CIMQualifierDecl>([](auto& x) { x.getValue(); });
    table["CIMQualifierDecl().getFlavor()"] = on<CIMQualifierDecl>([](auto& x) { x.getFlavor(); });
    table["CIMQualifierDecl().isUninitialized()"] = on<CIMQualifierDecl>([](auto& x) { x.isUninitialized(); });
    table["CIMConstInstance().getPropertyCount()"] = on<CIMConstInstance>([](auto& x) { x.getPropertyCount(); });
    table["isUninitialized() of default CIMClass/CIMInstance/CIMProperty"] = [](const Vector&) {
        return json{CIMClass().isUninitialized(), CIMInstance().isUninitialized(), CIMProperty().isUninitialized()};
    };
}

void addClasses(VectorTable& table)
{
    table["CIMClass(CIMName()) null name"] = [](const Vector&) { return CIMClass(CIMName()).isUninitialized(); };
    table["CIMClass(Foo,Bar): name, super, counts, path, isAssociation, isAbstract, hasKeys"] = [](const Vector&) {
        const CIMClass c("Foo", "Bar");
        return json{utf8(c.getClassName().getString()),
                    utf8(c.getSuperClassName().getString()),
                    c.getPropertyCount(),
                    c.getMethodCount(),
                    c.getQualifierCount(),
                    utf8(c.getPath().toString()),
                    c.isAssociation(),
                    c.isAbstract(),
                    c.hasKeys()};
    };
    const auto association = [](const CIMValue& value) {
        return [=](const Vector&) { return classWith(CIMQualifier("Association", value)).isAssociation(); };
    };
    table["class with Association=true"] = association(true);
    table["class with Association=false"] = association(false);
    table["class with Association=\"true\" (string)"] = association(String("true"));
    table["add property twice (case-insensitive)"] = [](const Vector&) {
        return CIMClass("Foo").addProperty(property("P")).addProperty(property("p")).getPropertyCount();
    };
    table["addProperty(CIMProperty())"] = [](const Vector&) {
        return CIMClass("Foo").addProperty(CIMProperty()).getPropertyCount();
    };
    table["findProperty case-insensitive; missing = PEG_NOT_FOUND"] = [](const Vector&) {
        CIMClass c("Foo");
        c.addProperty(property("Abc"));
        return json{c.findProperty("aBC"), c.findProperty("x")};
    };
    table["getProperty(5) out of range"] = [](const Vector&) {
        return CIMClass("Foo").getProperty(5).isUninitialized();
    };
    table["getQualifier(5)"] = [](const Vector&) { return CIMClass("Foo").getQualifier(5).isUninitialized(); };
    table["reference property on non-association class via addProperty"] = [](const Vector&) {
        CIMClass c("Foo");
        c.addProperty(CIMProperty("R", CIMValue(CIMTYPE_REFERENCE, false), 0, "Bar"));
        return c.getPropertyCount();
    };
}

void addInstances(VectorTable& table)
{
    table["CIMInstance(CIMName()) null name"] = [](const Vector&) { return CIMInstance(CIMName()).isUninitialized(); };
    table["instance getProperty(0) of empty"] = [](const Vector&) {
        return CIMInstance("Foo").getProperty(0).isUninitialized();
    };
    table["instance add property twice"] = [](const Vector&) {
        return CIMInstance("Foo").addProperty(property("P")).addProperty(property("P")).getPropertyCount();
    };
    table["i2=i1; i2.addProperty; i1.getPropertyCount (shared rep)"] = [](const Vector&) {
        const CIMInstance first("Foo");
        CIMInstance second = first;
        second.addProperty(property());
        return first.getPropertyCount();
    };
    table["p=inst.getProperty(0); p.setValue changes the instance's"] = [](const Vector&) {
        CIMInstance instance("Foo");
        instance.addProperty(property());
        CIMProperty handle = instance.getProperty(0);
        handle.setValue(CIMValue(Uint8(9)));
        return utf8(instance.getProperty(0).getValue().toString());
    };
    table["instance.buildPath(class with key K)"] = [](const Vector&) { return pathOf(withKey(String("a\"b"))); };
    table["buildPath when key value null"] = [](const Vector&) {
        return pathOf(withKey(CIMValue(CIMTYPE_STRING, false)));
    };
    table["buildPath when key property absent"] = [](const Vector&) { return pathOf(CIMInstance("Foo")); };
}

void addProperties(VectorTable& table)
{
    const CIMValue one(Uint8(1));
    table["CIMProperty(CIMName(),v)"] = [=](const Vector&) { return CIMProperty(CIMName(), one).isUninitialized(); };
    table["CIMProperty(uint8).setValue(String) type mismatch"] = [](const Vector&) {
        property().setValue(String("x"));
        return kDone;
    };
    table["CIMProperty(uint8).setValue(uint8 array)"] = [](const Vector&) {
        property().setValue(Array<Uint8>());
        return kDone;
    };
    table["CIMProperty(P,Uint8,arraySize=3)"] = [=](const Vector&) { return CIMProperty("P", one, 3).getArraySize(); };
    table["CIMProperty(P,Uint8,0,refClass)"] = [=](const Vector&) {
        return CIMProperty("P", one, 0, "X").getArraySize();
    };
    table["CIMProperty(P,reference null) without reference class"] = [](const Vector&) {
        return utf8(CIMProperty("P", CIMValue(CIMTYPE_REFERENCE, false)).getReferenceClassName().getString());
    };
    table["CIMProperty(P, reference array)"] = [](const Vector&) {
        return CIMProperty("P", CIMValue(CIMTYPE_REFERENCE, true)).getArraySize();
    };
    table["identical ignoring case of name"] = [](const Vector&) { return property("P").identical(property("p")); };
    table["CIMQualifier(Q,true): flavor toString, propagated"] = [](const Vector&) {
        const CIMQualifier qualifier("Q", CIMValue(true));
        return json{utf8(qualifier.getFlavor().toString()), qualifier.getPropagated()};
    };
    table["CIMQualifierDecl(Q,true,CLASS): flavor, scope"] = [](const Vector&) {
        const CIMQualifierDecl decl("Q", CIMValue(true), CIMScope::CLASS);
        return json{utf8(decl.getFlavor().toString()), utf8(decl.getScope().toString()), decl.getArraySize(),
                    decl.isArray()};
    };
}

void addMethods(VectorTable& table)
{
    table["CIMParameter(p,uint8,true,4)"] = [](const Vector&) {
        const CIMParameter parameter("p", CIMTYPE_UINT8, true, 4);
        return json{parameter.isArray(), parameter.getArraySize()};
    };
    const auto refused = [](CIMType type, bool isArray, Uint32 size, const char* className) {
        return [=](const Vector&) {
            return CIMParameter("p", type, isArray, size, *className ? CIMName(className) : CIMName()).getArraySize();
        };
    };
    table["CIMParameter(p,uint8,false,4)"] = refused(CIMTYPE_UINT8, false, 4, "");
    table["CIMParameter(p,reference)"] = refused(CIMTYPE_REFERENCE, false, 0, "");
    table["CIMParameter(p,uint8,false,0,X)"] = refused(CIMTYPE_UINT8, false, 0, "X");
    table["CIMMethod(CIMName(),uint8)"] = [](const Vector&) {
        return CIMMethod(CIMName(), CIMTYPE_UINT8).isUninitialized();
    };
    table["getParameter(1) of empty"] = [](const Vector&) {
        return CIMMethod("M", CIMTYPE_UINT8).getParameter(1).isUninitialized();
    };
    table["CIMParamValue().getValue()"] = [](const Vector&) { return describe(CIMParamValue().getValue()); };
    table["CIMParamValue(\"p\",CIMValue(Uint8(1)))"] = [](const Vector&) {
        const CIMParamValue parameter("p", CIMValue(Uint8(1)));
        return json{utf8(parameter.getParameterName()), parameter.isTyped(), describe(parameter.getValue()),
                    parameter.isUninitialized()};
    };
    table["CIMParamValue(\"\",CIMValue(Uint8(1)))"] = [](const Vector&) {
        return CIMParamValue("", CIMValue(Uint8(1))).isTyped();
    };
    table["CIMParamValue(\"p\",v,false).isTyped()"] = [](const Vector&) {
        return CIMParamValue("p", CIMValue(Uint8(1)), false).isTyped();
    };
    table["p2=p1; p2.setIsTyped(false); p1.isTyped()"] = [](const Vector&) {
        const CIMParamValue first("p", CIMValue(Uint8(1)));
        CIMParamValue second = first;
        second.setIsTyped(false);
        return first.isTyped();
    };
}

void addRest(VectorTable& table)
{
    table["CIMObject(instance with 3 props).toString()"] = [](const Vector&) {
        CIMInstance instance("Foo");
        instance.addProperty(CIMProperty("P", CIMValue(Uint32(1))));
        instance.addProperty(CIMProperty("S", String("a\"b")));
        instance.addProperty(CIMProperty("N", CIMValue(CIMTYPE_STRING, false)));
        return utf8(CIMObject(instance).toString());
    };
    table["CIMObject(class).toString()"] = [](const Vector&) {
        CIMClass cimClass("Foo");
        cimClass.addProperty(CIMProperty("P", CIMValue(CIMTYPE_UINT32, false)));
        return utf8(CIMObject(cimClass).toString());
    };
    table["CIMObject(CIMClass): isClass,isInstance"] = [](const Vector&) {
        const CIMObject object(CIMClass("Foo"));
        return json{object.isClass(), object.isInstance()};
    };
    table["CIMInstance(CIMObject(CIMClass))"] = [](const Vector&) {
        return CIMInstance(CIMObject(CIMClass("Foo"))).isUninitialized();
    };
    table["CIMClass(CIMObject(CIMInstance))"] = [](const Vector&) {
        return CIMClass(CIMObject(CIMInstance("Foo"))).isUninitialized();
    };
    const auto names = [](std::initializer_list<const char*> list) {
        Array<CIMName> array;
        for (const char* name : list) {
            array.append(name);
        }
        return CIMPropertyList(array);
    };
    table["CIMPropertyList(): isNull,size"] = [](const Vector&) {
        return json{CIMPropertyList().isNull(), CIMPropertyList().size()};
    };
    table["CIMPropertyList().toString() / empty"] = [=](const Vector&) {
        return json{utf8(CIMPropertyList().toString()), utf8(names({}).toString())};
    };
    table["CIMPropertyList{a,A} size"] = [=](const Vector&) { return names({"a", "A"}).size(); };
    table["CIMPropertyList{a}[3]"] = [=](const Vector&) { return utf8(names({"a"})[3].getString()); };
    table["sizeof(String,CIMName,CIMNamespaceName,CIMValue,CIMObjectPath,CIMDateTime,CIMClass,CIMInstance,CIMProperty,"
          "CIMFlavor,CIMScope,CIMClient,Array<Uint8>)"] = [](const Vector&) {
        return json{sizeof(String),        sizeof(CIMName),     sizeof(CIMNamespaceName), sizeof(CIMValue),
                    sizeof(CIMObjectPath), sizeof(CIMDateTime), sizeof(CIMClass),         sizeof(CIMInstance),
                    sizeof(CIMProperty),   sizeof(CIMFlavor),   sizeof(CIMScope),         sizeof(CIMClient),
                    sizeof(Array<Uint8>)};
    };
    table["typeid of Uint64/Sint64/Uint8/Sint8/Boolean"] = [](const Vector&) {
        return json{typeName(typeid(Uint64)), typeName(typeid(Sint64)), typeName(typeid(Uint8)),
                    typeName(typeid(Sint8)), typeName(typeid(Boolean))};
    };
}

} // namespace

void addObjectVectors(VectorTable& table)
{
    addUninitialized(table);
    addClasses(table);
    addInstances(table);
    addProperties(table);
    addMethods(table);
    addRest(table);
}

} // namespace test
