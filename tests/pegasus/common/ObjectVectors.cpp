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
    table["uninit.CIMClass.getClassName()"] = on<CIMClass>([](auto& x) { x.getClassName(); });
    table["uninit.CIMClass.getSuperClassName()"] = on<CIMClass>([](auto& x) { x.getSuperClassName(); });
    table["uninit.CIMClass.getQualifierCount()"] = on<CIMClass>([](auto& x) { x.getQualifierCount(); });
    table["uninit.CIMClass.findProperty(CIMName(\"a\"))"] = on<CIMClass>([](auto& x) { x.findProperty("a"); });
    table["uninit.CIMClass.isAssociation()"] = on<CIMClass>([](auto& x) { x.isAssociation(); });
    table["uninit.CIMClass.isAbstract()"] = on<CIMClass>([](auto& x) { x.isAbstract(); });
    table["uninit.CIMClass.isUninitialized()"] = on<CIMClass>([](auto& x) { x.isUninitialized(); });
    table["uninit.CIMClass.hasKeys()"] = on<CIMClass>([](auto& x) { x.hasKeys(); });
    table["uninit.CIMInstance.getClassName()"] = on<CIMInstance>([](auto& x) { x.getClassName(); });
    table["uninit.CIMInstance.getPropertyCount()"] = on<CIMInstance>([](auto& x) { x.getPropertyCount(); });
    table["uninit.CIMInstance.getQualifierCount()"] = on<CIMInstance>([](auto& x) { x.getQualifierCount(); });
    table["uninit.CIMInstance.isUninitialized()"] = on<CIMInstance>([](auto& x) { x.isUninitialized(); });
    table["uninit.CIMInstance.setPath(CIMObjectPath())"] = on<CIMInstance>([](auto& x) { x.setPath(CIMObjectPath()); });
    table["uninit.CIMObject.getClassName()"] = on<CIMObject>([](auto& x) { x.getClassName(); });
    table["uninit.CIMObject.isClass()"] = on<CIMObject>([](auto& x) { x.isClass(); });
    table["uninit.CIMObject.isInstance()"] = on<CIMObject>([](auto& x) { x.isInstance(); });
    table["uninit.CIMObject.toString()"] = on<CIMObject>([](auto& x) { x.toString(); });
    table["uninit.CIMProperty.getName()"] = on<CIMProperty>([](auto& x) { x.getName(); });
    table["uninit.CIMProperty.getValue()"] = on<CIMProperty>([](auto& x) { x.getValue(); });
    table["uninit.CIMProperty.getType()"] = on<CIMProperty>([](auto& x) { x.getType(); });
    table["uninit.CIMProperty.isArray()"] = on<CIMProperty>([](auto& x) { x.isArray(); });
    table["uninit.CIMProperty.setValue(CIMValue(Uint8(1)))"] =
        on<CIMProperty>([](auto& x) { x.setValue(CIMValue(Uint8(1))); });
    table["uninit.CIMMethod.getName()"] = on<CIMMethod>([](auto& x) { x.getName(); });
    table["uninit.CIMMethod.getType()"] = on<CIMMethod>([](auto& x) { x.getType(); });
    table["uninit.CIMMethod.getParameterCount()"] = on<CIMMethod>([](auto& x) { x.getParameterCount(); });
    table["uninit.CIMMethod.isUninitialized()"] = on<CIMMethod>([](auto& x) { x.isUninitialized(); });
    table["uninit.CIMParameter.getName()"] = on<CIMParameter>([](auto& x) { x.getName(); });
    table["uninit.CIMParameter.isArray()"] = on<CIMParameter>([](auto& x) { x.isArray(); });
    table["uninit.CIMParameter.isUninitialized()"] = on<CIMParameter>([](auto& x) { x.isUninitialized(); });
    table["uninit.CIMQualifier.getName()"] = on<CIMQualifier>([](auto& x) { x.getName(); });
    table["uninit.CIMQualifier.getValue()"] = on<CIMQualifier>([](auto& x) { x.getValue(); });
    table["uninit.CIMQualifier.getFlavor()"] = on<CIMQualifier>([](auto& x) { x.getFlavor(); });
    table["uninit.CIMQualifier.isUninitialized()"] = on<CIMQualifier>([](auto& x) { x.isUninitialized(); });
    table["uninit.CIMQualifierDecl.getName()"] = on<CIMQualifierDecl>([](auto& x) { x.getName(); });
    table["uninit.CIMQualifierDecl.getValue()"] = on<CIMQualifierDecl>([](auto& x) { x.getValue(); });
    table["uninit.CIMQualifierDecl.getFlavor()"] = on<CIMQualifierDecl>([](auto& x) { x.getFlavor(); });
    table["uninit.CIMQualifierDecl.isUninitialized()"] = on<CIMQualifierDecl>([](auto& x) { x.isUninitialized(); });
    table["uninit.constinst"] = on<CIMConstInstance>([](auto& x) { x.getPropertyCount(); });
    table["uninit.values"] = [](const Vector&) {
        return json{CIMClass().isUninitialized(), CIMInstance().isUninitialized(), CIMProperty().isUninitialized()};
    };
}

void addClasses(VectorTable& table)
{
    table["class.ctor.null"] = [](const Vector&) { return CIMClass(CIMName()).isUninitialized(); };
    table["class.basic"] = [](const Vector&) {
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
    table["class.assoc"] = association(true);
    table["class.assoc.false"] = association(false);
    table["class.assoc.string"] = association(String("true"));
    table["class.dupprop"] = [](const Vector&) {
        return CIMClass("Foo").addProperty(property("P")).addProperty(property("p")).getPropertyCount();
    };
    table["class.adduninit"] = [](const Vector&) {
        return CIMClass("Foo").addProperty(CIMProperty()).getPropertyCount();
    };
    table["class.find"] = [](const Vector&) {
        CIMClass c("Foo");
        c.addProperty(property("Abc"));
        return json{c.findProperty("aBC"), c.findProperty("x")};
    };
    table["class.getprop.oob"] = [](const Vector&) { return CIMClass("Foo").getProperty(5).isUninitialized(); };
    table["class.getqual.oob"] = [](const Vector&) { return CIMClass("Foo").getQualifier(5).isUninitialized(); };
    table["class.refprop.nonassoc"] = [](const Vector&) {
        CIMClass c("Foo");
        c.addProperty(CIMProperty("R", CIMValue(CIMTYPE_REFERENCE, false), 0, "Bar"));
        return c.getPropertyCount();
    };
}

void addInstances(VectorTable& table)
{
    table["inst.ctor.null"] = [](const Vector&) { return CIMInstance(CIMName()).isUninitialized(); };
    table["inst.getprop.oob"] = [](const Vector&) { return CIMInstance("Foo").getProperty(0).isUninitialized(); };
    table["inst.dupprop"] = [](const Vector&) {
        return CIMInstance("Foo").addProperty(property("P")).addProperty(property("P")).getPropertyCount();
    };
    table["inst.copy.shared"] = [](const Vector&) {
        const CIMInstance first("Foo");
        CIMInstance second = first;
        second.addProperty(property());
        return first.getPropertyCount();
    };
    table["inst.prop.shared"] = [](const Vector&) {
        CIMInstance instance("Foo");
        instance.addProperty(property());
        CIMProperty handle = instance.getProperty(0);
        handle.setValue(CIMValue(Uint8(9)));
        return utf8(instance.getProperty(0).getValue().toString());
    };
    table["buildPath"] = [](const Vector&) { return pathOf(withKey(String("a\"b"))); };
    table["buildPath.null"] = [](const Vector&) { return pathOf(withKey(CIMValue(CIMTYPE_STRING, false))); };
    table["buildPath.missing"] = [](const Vector&) { return pathOf(CIMInstance("Foo")); };
}

void addProperties(VectorTable& table)
{
    const CIMValue one(Uint8(1));
    table["prop.ctor.null"] = [=](const Vector&) { return CIMProperty(CIMName(), one).isUninitialized(); };
    table["prop.setValue.type"] = [](const Vector&) {
        property().setValue(String("x"));
        return kDone;
    };
    table["prop.setValue.array"] = [](const Vector&) {
        property().setValue(Array<Uint8>());
        return kDone;
    };
    table["prop.arraysize.scalar"] = [=](const Vector&) { return CIMProperty("P", one, 3).getArraySize(); };
    table["prop.refclass.nonref"] = [=](const Vector&) { return CIMProperty("P", one, 0, "X").getArraySize(); };
    table["prop.ref.norefclass"] = [](const Vector&) {
        return utf8(CIMProperty("P", CIMValue(CIMTYPE_REFERENCE, false)).getReferenceClassName().getString());
    };
    table["prop.refarray"] = [](const Vector&) {
        return CIMProperty("P", CIMValue(CIMTYPE_REFERENCE, true)).getArraySize();
    };
    table["prop.ident"] = [](const Vector&) { return property("P").identical(property("p")); };
    table["qual.defaults"] = [](const Vector&) {
        const CIMQualifier qualifier("Q", CIMValue(true));
        return json{utf8(qualifier.getFlavor().toString()), qualifier.getPropagated()};
    };
    table["qdecl.defaults"] = [](const Vector&) {
        const CIMQualifierDecl decl("Q", CIMValue(true), CIMScope::CLASS);
        return json{utf8(decl.getFlavor().toString()), utf8(decl.getScope().toString()), decl.getArraySize(),
                    decl.isArray()};
    };
}

void addMethods(VectorTable& table)
{
    table["param.arraysize"] = [](const Vector&) {
        const CIMParameter parameter("p", CIMTYPE_UINT8, true, 4);
        return json{parameter.isArray(), parameter.getArraySize()};
    };
    const auto refused = [](CIMType type, bool isArray, Uint32 size, const char* className) {
        return [=](const Vector&) {
            return CIMParameter("p", type, isArray, size, *className ? CIMName(className) : CIMName()).getArraySize();
        };
    };
    table["param.arraysize.bad"] = refused(CIMTYPE_UINT8, false, 4, "");
    table["param.ref.noclass"] = refused(CIMTYPE_REFERENCE, false, 0, "");
    table["param.nonref.class"] = refused(CIMTYPE_UINT8, false, 0, "X");
    table["method.null"] = [](const Vector&) { return CIMMethod(CIMName(), CIMTYPE_UINT8).isUninitialized(); };
    table["method.getparam.oob"] = [](const Vector&) {
        return CIMMethod("M", CIMTYPE_UINT8).getParameter(1).isUninitialized();
    };
    table["pv.default.getValue"] = [](const Vector&) { return describe(CIMParamValue().getValue()); };
    table["pv.1"] = [](const Vector&) {
        const CIMParamValue parameter("p", CIMValue(Uint8(1)));
        return json{utf8(parameter.getParameterName()), parameter.isTyped(), describe(parameter.getValue()),
                    parameter.isUninitialized()};
    };
    table["pv.emptyname"] = [](const Vector&) { return CIMParamValue("", CIMValue(Uint8(1))).isTyped(); };
    table["pv.untyped"] = [](const Vector&) { return CIMParamValue("p", CIMValue(Uint8(1)), false).isTyped(); };
    table["pv.copy.shared"] = [](const Vector&) {
        const CIMParamValue first("p", CIMValue(Uint8(1)));
        CIMParamValue second = first;
        second.setIsTyped(false);
        return first.isTyped();
    };
}

void addRest(VectorTable& table)
{
    table["obj.toString.inst"] = [](const Vector&) {
        CIMInstance instance("Foo");
        instance.addProperty(CIMProperty("P", CIMValue(Uint32(1))));
        instance.addProperty(CIMProperty("S", String("a\"b")));
        instance.addProperty(CIMProperty("N", CIMValue(CIMTYPE_STRING, false)));
        return utf8(CIMObject(instance).toString());
    };
    table["obj.toString.class"] = [](const Vector&) {
        CIMClass cimClass("Foo");
        cimClass.addProperty(CIMProperty("P", CIMValue(CIMTYPE_UINT32, false)));
        return utf8(CIMObject(cimClass).toString());
    };
    table["obj.fromclass"] = [](const Vector&) {
        const CIMObject object(CIMClass("Foo"));
        return json{object.isClass(), object.isInstance()};
    };
    table["obj.cast.bad"] = [](const Vector&) { return CIMInstance(CIMObject(CIMClass("Foo"))).isUninitialized(); };
    table["obj.cast.bad2"] = [](const Vector&) { return CIMClass(CIMObject(CIMInstance("Foo"))).isUninitialized(); };
    const auto names = [](std::initializer_list<const char*> list) {
        Array<CIMName> array;
        for (const char* name : list) {
            array.append(name);
        }
        return CIMPropertyList(array);
    };
    table["pl.null"] = [](const Vector&) { return json{CIMPropertyList().isNull(), CIMPropertyList().size()}; };
    table["pl.toString.null"] = [=](const Vector&) {
        return json{utf8(CIMPropertyList().toString()), utf8(names({}).toString())};
    };
    table["pl.dup"] = [=](const Vector&) { return names({"a", "A"}).size(); };
    table["pl.oob"] = [=](const Vector&) { return utf8(names({"a"})[3].getString()); };
    table["sizeof.objs"] = [](const Vector&) {
        return json{sizeof(String),        sizeof(CIMName),     sizeof(CIMNamespaceName), sizeof(CIMValue),
                    sizeof(CIMObjectPath), sizeof(CIMDateTime), sizeof(CIMClass),         sizeof(CIMInstance),
                    sizeof(CIMProperty),   sizeof(CIMFlavor),   sizeof(CIMScope),         sizeof(CIMClient),
                    sizeof(Array<Uint8>)};
    };
    table["typeid.u64"] = [](const Vector&) {
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
