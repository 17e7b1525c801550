// SPDX-License-Identifier: MIT
// Every public name and member, used as a user's program would use it, through one public header and with the one macro
// that it asks for. That it compiles and links is the whole test; what the members do is tested elsewhere.
#include <Pegasus/Client/CIMClient.h>

#include <initializer_list>

PEGASUS_USING_PEGASUS;

namespace apinames {

// ---- shapes that several classes share

template <typename T, typename Const> void useHandle(T& x, const Const& readOnly)
{
    T copy(x);
    copy = x;
    Const twin(x);
    twin = x;
    x = readOnly.clone();
    (void)(readOnly.identical(twin) && readOnly.isUninitialized());
}

template <typename T, typename Const> void useQualifiers(T& x, const Const& readOnly)
{
    x.addQualifier(CIMQualifier("Q", CIMValue(true)));
    CIMQualifier qualifier = x.getQualifier(x.findQualifier("Q"));
    const CIMConstQualifier same = readOnly.getQualifier(readOnly.getQualifierCount() - 1);
    x.removeQualifier(0);
}

template <typename T, typename Const> void useProperties(T& x, const Const& readOnly)
{
    x.addProperty(CIMProperty("P", CIMValue(true)));
    CIMProperty property = x.getProperty(x.findProperty("P"));
    const CIMConstProperty same = readOnly.getProperty(readOnly.getPropertyCount() - 1);
    x.removeProperty(0);
    x.setPath(readOnly.getPath());
    const CIMName& name = readOnly.getClassName();
    (void)name;
}

template <typename T> void useOrigin(T& x)
{
    x.setName(x.getName());
    x.setClassOrigin(x.getClassOrigin());
    x.setPropagated(x.getPropagated());
}

template <typename T> Uint32 useArray(const T& x)
{
    Array<T> array;
    Array<T> sized(2);
    Array<T> filled(2, x);
    const Array<T> copied(filled.getData(), filled.size());
    array = copied;
    array.reserveCapacity(array.getCapacity());
    array.grow(1, x);
    array.swap(filled);
    array.append(x);
    array.append(&x, 1);
    array.appendArray(sized);
    array.prepend(x);
    array.prepend(&x, 1);
    array.insert(0, x);
    array.insert(0, &x, 1);
    array[0] = copied[0];
    array.remove(0);
    array.remove(0, 1);
    array.clear();
    return array.size();
}

// ---- class by class

void useStrings(String& x, const Char16* units)
{
    String all[] = {String(), String(x), String(x, 1), String(units), String(units, 1), String("a"), String("a", 1)};
    x.assign(all[0]).assign(units).assign(units, 1).assign("a").assign("a", 1);
    x.append(Char16('a')).append(units, 1).append(String::EMPTY);
    x.reserveCapacity(x.size());
    x[0] = x.getChar16Data()[0];
    const Char16 unit = static_cast<const String&>(x)[0];
    x.remove(x.find(unit));
    x.remove(x.find(0, unit), x.reverseFind(unit));
    x = x.subString(x.find(all[0])) + x.subString(0, 1);
    x.toLower();
    x.appendPrintf("%d", String::compare(x, all[0]) + String::compare(x, all[0], 1) + String::compareNoCase(x, all[0]));
    (void)(String::equal(x, all[0]) || String::equalNoCase(x, all[0]) || x == all[0] || x == "a" || "a" == x);
    (void)(x != all[0] || x < all[0] || x <= all[0] || x > all[0] || x >= all[0] || unit == 'a' || unit != unit);
    CString bytes = x.getCString();
    const CString copy(bytes);
    bytes = copy;
    const char* text = bytes;
    (void)text;
    x.clear();
}

template <typename Name> void useNames(Name& name)
{
    const String text = name.getString();
    name = Name("root");
    name = Name(text);
    name = text;
    (void)(name.isNull() || Name::legal(text) || name.equal(name) || name == name || name != name);
    name.clear();
}

void usePaths(CIMObjectPath& path, CIMKeyBinding& key)
{
    key = CIMKeyBinding(key.getName(), key.getValue(), key.getType());
    key = CIMKeyBinding("K", CIMValue(Uint8(1)));
    key.setName("K");
    key.setValue("1");
    key.setType(CIMKeyBinding::NUMERIC);
    (void)(key.equal(CIMValue(true)) || key == CIMKeyBinding());
    constexpr CIMKeyBinding::Type types[] = {CIMKeyBinding::BOOLEAN, CIMKeyBinding::STRING, CIMKeyBinding::REFERENCE};
    (void)types;
    path = CIMObjectPath(path.getHost(), path.getNameSpace(), path.getClassName(), path.getKeyBindings());
    path = CIMObjectPath(String(), CIMNamespaceName(), "C");
    path = path.toString();
    path.set(path.toString());
    path.set(String(), CIMNamespaceName(), "C", Array<CIMKeyBinding>());
    path.setHost("h");
    path.setNameSpace("root");
    path.setClassName("C");
    path.setKeyBindings(Array<CIMKeyBinding>(1, key));
    (void)(path.identical(path) || path == path || path != path || path.makeHashCode() > 0);
    path.clear();
}

void useDateTimes(CIMDateTime& x)
{
    x = CIMDateTime(x.toString());
    x = CIMDateTime(x.toMicroSeconds(), x.isInterval());
    x.set(x.toString());
    x = ((x + x) - x) * 2 / 2;
    x += x;
    x -= CIMDateTime(x);
    x *= x / x;
    x /= 2;
    (void)(x.equal(x) || x < x || x <= x || x > x || x >= x || x == x || x != x);
    (void)CIMDateTime::getDifference(x, CIMDateTime::getCurrentDateTime());
    x.clear();
}

template <typename Flags> void useBits(Flags& x, const Flags& other)
{
    Flags copy(x);
    copy = x + other;
    (void)(copy.equal(x) && copy.toString() == String());
}

void useFlags(CIMScope& scope, CIMFlavor& flavor)
{
    for (const CIMScope& one :
         {CIMScope::NONE, CIMScope::CLASS, CIMScope::ASSOCIATION, CIMScope::INDICATION, CIMScope::PROPERTY,
          CIMScope::REFERENCE, CIMScope::METHOD, CIMScope::PARAMETER, CIMScope::ANY})
    {
        scope.addScope(one);
    }
    for (const CIMFlavor& one :
         {CIMFlavor::NONE, CIMFlavor::OVERRIDABLE, CIMFlavor::ENABLEOVERRIDE, CIMFlavor::TOSUBCLASS,
          CIMFlavor::TOSUBELEMENTS, CIMFlavor::TOINSTANCE, CIMFlavor::TRANSLATABLE, CIMFlavor::DISABLEOVERRIDE,
          CIMFlavor::RESTRICTED, CIMFlavor::DEFAULTS})
    {
        flavor.addFlavor(one);
    }
    flavor.removeFlavor(CIMFlavor());
    (void)(scope.hasScope(CIMScope()) || flavor.hasFlavor(CIMFlavor::NONE));
    useBits(scope, CIMScope::ANY);
    useBits(flavor, CIMFlavor::DEFAULTS);
}

void useValues(CIMValue& value, CIMParamValue& parameter, CIMPropertyList& list)
{
    value = CIMValue(CIMTYPE_STRING, true, 3);
    value.setNullValue(value.getType(), value.isArray(), value.getArraySize());
    value.assign(CIMValue(value));
    (void)(value.typeCompatible(value) || value.isNull() || value.equal(value) || value == value || value != value);
    String name = value.toString();
    value.clear();

    parameter = CIMParamValue(parameter.getParameterName(), parameter.getValue(), parameter.isTyped());
    parameter = CIMParamValue(name, value).clone();
    parameter.setParameterName(name);
    parameter.setValue(value);
    parameter.setIsTyped(parameter.isUninitialized());

    list = CIMPropertyList(list.getPropertyNameArray());
    list.set(Array<CIMName>());
    (void)(list.isNull() || list.size() == 0 || list.contains(list[0]) || list.toString() == name);
    list.clear();
}

void useDeclarations(CIMProperty& property, CIMMethod& method, CIMParameter& parameter, CIMQualifier& qualifier)
{
    useHandle<CIMProperty, CIMConstProperty>(property, property);
    useQualifiers<CIMProperty, CIMConstProperty>(property, property);
    useOrigin(property);
    property =
        CIMProperty("P", property.getValue(), property.getArraySize(), property.getReferenceClassName(), "C", true);
    property.setValue(CIMValue(property.getType(), property.isArray()));

    useHandle<CIMMethod, CIMConstMethod>(method, method);
    useQualifiers<CIMMethod, CIMConstMethod>(method, method);
    useOrigin(method);
    method = CIMMethod("M", method.getType(), "C", true);
    method.setType(CIMTYPE_UINT32);
    method.addParameter(parameter);
    parameter = method.getParameter(method.findParameter("p"));
    const CIMConstParameter same = CIMConstMethod(method).getParameter(method.getParameterCount() - 1);
    method.removeParameter(0);

    useHandle<CIMParameter, CIMConstParameter>(parameter, parameter);
    useQualifiers<CIMParameter, CIMConstParameter>(parameter, parameter);
    parameter = CIMParameter("p", parameter.getType(), parameter.isArray(), parameter.getArraySize(), "C");
    parameter.setName(parameter.getReferenceClassName());

    useHandle<CIMQualifier, CIMConstQualifier>(qualifier, qualifier);
    qualifier = CIMQualifier(qualifier.getName(), CIMValue(qualifier.getType(), qualifier.isArray()),
                             qualifier.getFlavor(), qualifier.getPropagated() != 0);
    qualifier.setName("Q");
    qualifier.setValue(qualifier.getValue());
    qualifier.setFlavor(CIMFlavor::NONE);
    qualifier.unsetFlavor(CIMFlavor::NONE);
    qualifier.setPropagated(false);
}

void useObjects(CIMClass& cimClass, CIMInstance& instance, CIMObject& object, CIMQualifierDecl& declaration)
{
    useHandle<CIMClass, CIMConstClass>(cimClass, cimClass);
    useQualifiers<CIMClass, CIMConstClass>(cimClass, cimClass);
    useProperties<CIMClass, CIMConstClass>(cimClass, cimClass);
    cimClass.setSuperClassName(cimClass.getSuperClassName());
    cimClass.addMethod(CIMMethod());
    CIMMethod method = cimClass.getMethod(cimClass.findMethod("M"));
    const CIMConstMethod same = CIMConstClass(cimClass).getMethod(cimClass.getMethodCount() - 1);
    cimClass.removeMethod(0);
    Array<CIMName> keys;
    cimClass.getKeyNames(keys);
    (void)(cimClass.isAssociation() || cimClass.isAbstract() || cimClass.hasKeys());

    useHandle<CIMInstance, CIMConstInstance>(instance, instance);
    useQualifiers<CIMInstance, CIMConstInstance>(instance, instance);
    useProperties<CIMInstance, CIMConstInstance>(instance, instance);
    instance = cimClass.buildInstance(true, true, CIMPropertyList());
    instance.setPath(instance.buildPath(cimClass));
    instance.instanceFilter(true, true, CIMPropertyList());

    useHandle<CIMObject, CIMConstObject>(object, object);
    useQualifiers<CIMObject, CIMConstObject>(object, object);
    useProperties<CIMObject, CIMConstObject>(object, object);
    object = object.isClass() ? CIMObject(CIMClass(object)) : CIMObject(CIMInstance(object));
    object.instanceFilter(true, true, CIMPropertyList());
    (void)(object.isInstance() || object.toString() == String());

    useHandle<CIMQualifierDecl, CIMConstQualifierDecl>(declaration, declaration);
    declaration = CIMQualifierDecl(declaration.getName(), declaration.getValue(), declaration.getScope(),
                                   declaration.getFlavor(), declaration.getArraySize());
    declaration.setName("Q");
    declaration.setValue(CIMValue(declaration.getType(), declaration.isArray()));
}

void useArrays()
{
    useArray(Boolean());
    useArray(Uint8());
    useArray(Sint8());
    useArray(Uint16());
    useArray(Sint16());
    useArray(Uint32());
    useArray(Sint32());
    useArray(Uint64());
    useArray(Sint64());
    useArray(Real32());
    useArray(Real64());
    useArray(Char16());
    useArray(String());
    useArray(CIMName());
    useArray(CIMNamespaceName());
    useArray(CIMKeyBinding());
    useArray(CIMObjectPath());
    useArray(CIMDateTime());
    useArray(CIMValue());
    useArray(CIMQualifier());
    useArray(CIMQualifierDecl());
    useArray(CIMProperty());
    useArray(CIMParameter());
    useArray(CIMMethod());
    useArray(CIMClass());
    useArray(CIMInstance());
    useArray(CIMObject());
    useArray(CIMParamValue());
}

template <typename Thrown, typename... Arguments> void useException(const Arguments&... arguments)
{
    Thrown thrown(arguments...);
    const Thrown copy(thrown);
    thrown = copy;
    const String& message = static_cast<const Exception&>(thrown).getMessage();
    (void)message;
}

void useExceptions(const String& text)
{
    useException<Exception>(text);
    useException<IndexOutOfBoundsException>();
    useException<AlreadyExistsException>(text);
    useException<InvalidNameException>(text);
    useException<InvalidNamespaceNameException>(text);
    useException<UninitializedObjectException>();
    useException<TypeMismatchException>();
    useException<TypeMismatchException>(text);
    useException<DynamicCastFailedException>();
    useException<InvalidDateTimeFormatException>();
    useException<DateTimeOutOfRangeException>(text);
    useException<MalformedObjectNameException>(text);
    useException<BindFailedException>(text);
    useException<InvalidLocatorException>(text);
    useException<CannotCreateSocketException>();
    useException<CannotConnectException>(text);
    useException<AlreadyConnectedException>();
    useException<NotConnectedException>();
    useException<ConnectionTimeoutException>();
    useException<InvalidEnumerationContextException>();
    useException<SSLException>(text);
    useException<CIMException>();
    useException<CIMException>(CIM_ERR_FAILED, text);
    useException<CIMException>(CIM_ERR_FAILED, text, CIMInstance());
    useException<CIMException>(CIM_ERR_FAILED, text, Array<CIMInstance>());
    useException<CIMClientMalformedHTTPException>(text);
    useException<CIMClientHTTPErrorException>(400U, text, text);
    useException<CIMClientHTTPErrorException>(400U, text, text, text);
    useException<CIMClientXmlException>(text);
    useException<CIMClientResponseException>(text);
    const CIMClientHTTPErrorException http(400, text, text);
    (void)(http.getCIMError() == http.getCIMErrorDetail() || http.getCode() == Uint32(CIMException().getCode()));
    (void)(cimStatusCodeToString(CIM_ERR_SERVER_IS_SHUTTING_DOWN) == cimTypeToString(CIMTYPE_INSTANCE));
}

// ---- the macros

PEGASUS_EXPORT PEGASUS_NAMESPACE(Sint64) useMacros()
{
    static_assert(sizeof(PEGASUS_64BIT_CONVERSION_WIDTH) == 3 && PEG_NOT_FOUND == Uint32(-1), "");
    return PEGASUS_SINT64_LITERAL(1) + Sint64(PEGASUS_UINT64_LITERAL(1));
}

// ---- the operations, with and without their default arguments

void useOperations(CIMClient& client, const CIMPropertyList& list)
{
    client.connect("localhost", 5988, String::EMPTY, String::EMPTY);
    client.connectLocal();
    client.setTimeout(client.getTimeout());
    client.setMaxDecodedBytes(client.getMaxDecodedBytes());
    const CIMClass cimClass = client.getClass("root/cimv2", "CIM_X");
    client.getClass("root/cimv2", "CIM_X", false, true, false, list);
    const CIMInstance instance = client.getInstance("root/cimv2", CIMObjectPath("CIM_X.K=1"));
    client.getInstance("root/cimv2", CIMObjectPath("CIM_X.K=1"), false, true, true, list);
    const Array<CIMInstance> instances = client.enumerateInstances("root/cimv2", "CIM_X");
    client.enumerateInstances("root/cimv2", "CIM_X", false, true, false, false, list);
    const Array<CIMObjectPath> paths = client.enumerateInstanceNames("root/cimv2", "CIM_X");
    const Array<CIMClass> classes = client.enumerateClasses("root/cimv2");
    client.enumerateClasses("root/cimv2", CIMName(), true, false, false, true);
    const Array<CIMName> names = client.enumerateClassNames("root/cimv2");
    client.enumerateClassNames("root/cimv2", CIMName(), true);
    const CIMQualifierDecl declaration = client.getQualifier("root/cimv2", "Key");
    const Array<CIMQualifierDecl> declarations = client.enumerateQualifiers("root/cimv2");
    client.setQualifier("root/cimv2", declaration);
    client.createClass("root/cimv2", cimClass);
    const CIMObjectPath created = client.createInstance("root/cimv2", instance);
    client.modifyInstance("root/cimv2", instance);
    client.modifyInstance("root/cimv2", instance, false, list);
    client.deleteInstance("root/cimv2", created);
    Array<CIMParamValue> outputs;
    const CIMValue result = client.invokeMethod("root/cimv2", created, "M", Array<CIMParamValue>(), outputs);
    client.disconnect();
}

template void useNames<CIMName>(CIMName&);
template void useNames<CIMNamespaceName>(CIMNamespaceName&);

} // namespace apinames
