// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/client/CIMClientRep.h"
#include "pegasus/client/InstanceReader.h"

#include <Pegasus/Client/CIMClient.h>

namespace Pegasus {
namespace {

using client::makeRequest;
using wire::ElementDecoder;
using wire::IntrinsicCall;
using wire::XmlElement;
using wire::XmlOffer;

[[noreturn]] void failUnexpected(const XmlElement& element)
{
    element.fail(wire::XmlError::Kind::kInvalid,
                 "Expected close of IRETURNVALUE element, got " + std::string(element.name()) + " instead");
}

// An operation whose result is one object, which is read, or taken from its text. A success whose result is absent
// gives an uninitialised object.
template <typename T, typename Read, typename Take>
T readOne(CIMClientRep& rep, client::Request request, const char* elementName, const Read& read, const Take& take)
{
    T result;
    bool found = false;
    request.result = elementName;
    rep.exchange(
        request,
        [&](const XmlElement& element, ElementDecoder& decoder) {
            if (found) {
                failUnexpected(element);
            }
            result = read(element, decoder);
            found = true;
        },
        [&](std::string_view text, ElementDecoder& decoder) {
            const XmlOffer offer = found ? XmlOffer() : take(text, decoder, result);
            found = found || offer.result == XmlOffer::Result::kTaken;
            return offer;
        });
    return result;
}

template <typename T>
T readOne(CIMClientRep& rep, const client::Request& request, const char* elementName,
          T (ElementDecoder::*decode)(const XmlElement&))
{
    return readOne<T>(
        rep, request, elementName,
        [decode](const XmlElement& element, ElementDecoder& decoder) { return (decoder.*decode)(element); },
        [](std::string_view, ElementDecoder&, T&) { return XmlOffer(); });
}

CIMClass readClass(CIMClientRep& rep, const client::Request& request)
{
    client::KnownClasses& known = rep.knownClasses();
    return readOne<CIMClass>(
        rep, request, "CLASS",
        [&](const XmlElement& element, ElementDecoder& decoder) {
            const std::size_t before = decoder.decodedBytes();
            const CIMClass decoded = decoder.decodeClass(element);
            known.learn(element, decoded, decoder.decodedBytes() - before);
            return decoded;
        },
        [&](std::string_view text, ElementDecoder& decoder, CIMClass& taken) {
            const XmlOffer offer = known.take(text, taken);
            if (offer.result == XmlOffer::Result::kTaken) {
                decoder.addDecodedBytes(known.bytes());
            }
            return offer;
        });
}

// An operation whose result is a list.
template <typename T>
Array<T> readAll(CIMClientRep& rep, const client::Request& request, T (ElementDecoder::*decode)(const XmlElement&))
{
    Array<T> results;
    rep.exchange(request, [&](const XmlElement& element, ElementDecoder& decoder) {
        results.append((decoder.*decode)(element));
    });
    return results;
}

Array<CIMInstance> readInstances(CIMClientRep& rep, const client::Request& request)
{
    client::InstanceReader reader(rep.knownInstances());
    rep.exchange(
        request, [&](const XmlElement& element, ElementDecoder& decoder) { reader.read(element, decoder); },
        [&](std::string_view text, ElementDecoder& decoder) { return reader.offer(text, decoder); });
    return reader.instances();
}

void readNothing(CIMClientRep& rep, const client::Request& request)
{
    rep.exchange(request, [](const XmlElement& element, ElementDecoder&) { failUnexpected(element); });
}

// OpenPegasus's client drops the type of a null output, whatever type the answer names.
CIMParamValue asOutput(const CIMParamValue& output)
{
    return output.getValue().isNull() ? CIMParamValue(output.getParameterName(), CIMValue(), false) : output;
}

} // namespace

CIMClient::CIMClient() : fRep(new CIMClientRep()) {}

CIMClient::~CIMClient()
{
    delete fRep;
}

Uint32 CIMClient::getTimeout() const
{
    return fRep->timeoutMs();
}

void CIMClient::setTimeout(Uint32 timeoutMilliseconds)
{
    fRep->setTimeoutMs(timeoutMilliseconds);
}

Uint64 CIMClient::getMaxDecodedBytes() const
{
    return fRep->maxDecodedBytes();
}

void CIMClient::setMaxDecodedBytes(Uint64 bytes)
{
    fRep->setMaxDecodedBytes(bytes);
}

void CIMClient::connect(const String& host, const Uint32 portNumber, const String&, const String&)
{
    if (host.size() == 0 && portNumber == 0) {
        return connectLocal();
    }
    client::ServerAddress address;
    address.host = host.size() > 0 ? base::utf8(host) : "localhost";
    address.port = portNumber;
    fRep->connect(address);
}

void CIMClient::connectLocal()
{
    client::ServerAddress address;
    address.isLocal = true;
    fRep->connect(address);
}

void CIMClient::disconnect()
{
    fRep->disconnect();
}

CIMClass CIMClient::getClass(const CIMNamespaceName& nameSpace, const CIMName& className, Boolean localOnly,
                             Boolean includeQualifiers, Boolean includeClassOrigin, const CIMPropertyList& propertyList)
{
    IntrinsicCall call("GetClass", nameSpace);
    call.className("ClassName", className)
        .flag("LocalOnly", localOnly, true)
        .flag("IncludeQualifiers", includeQualifiers, true)
        .flag("IncludeClassOrigin", includeClassOrigin, false)
        .propertyList(propertyList);
    return readClass(*fRep, makeRequest(call));
}

Array<CIMClass> CIMClient::enumerateClasses(const CIMNamespaceName& nameSpace, const CIMName& className,
                                            Boolean deepInheritance, Boolean localOnly, Boolean includeQualifiers,
                                            Boolean includeClassOrigin)
{
    IntrinsicCall call("EnumerateClasses", nameSpace);
    call.className("ClassName", className)
        .flag("DeepInheritance", deepInheritance, false)
        .flag("LocalOnly", localOnly, true)
        .flag("IncludeQualifiers", includeQualifiers, true)
        .flag("IncludeClassOrigin", includeClassOrigin, false);
    return readAll(*fRep, makeRequest(call), &ElementDecoder::decodeClass);
}

Array<CIMName> CIMClient::enumerateClassNames(const CIMNamespaceName& nameSpace, const CIMName& className,
                                              Boolean deepInheritance)
{
    IntrinsicCall call("EnumerateClassNames", nameSpace);
    call.className("ClassName", className).flag("DeepInheritance", deepInheritance, false);
    return readAll(*fRep, makeRequest(call), &ElementDecoder::decodeClassName);
}

void CIMClient::createClass(const CIMNamespaceName& nameSpace, const CIMClass& newClass)
{
    IntrinsicCall call("CreateClass", nameSpace);
    call.newClass(newClass);
    readNothing(*fRep, makeRequest(call));
}

CIMInstance CIMClient::getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& instanceName,
                                   Boolean localOnly, Boolean includeQualifiers, Boolean includeClassOrigin,
                                   const CIMPropertyList& propertyList)
{
    IntrinsicCall call("GetInstance", nameSpace);
    call.instanceName(instanceName)
        .flag("LocalOnly", localOnly, true)
        .flag("IncludeQualifiers", includeQualifiers, false)
        .flag("IncludeClassOrigin", includeClassOrigin, false)
        .propertyList(propertyList);
    return readOne(*fRep, makeRequest(call), "INSTANCE", &ElementDecoder::decodeInstance);
}

Array<CIMInstance> CIMClient::enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                 Boolean deepInheritance, Boolean localOnly, Boolean includeQualifiers,
                                                 Boolean includeClassOrigin, const CIMPropertyList& propertyList)
{
    IntrinsicCall call("EnumerateInstances", nameSpace);
    call.className("ClassName", className)
        .flag("LocalOnly", localOnly, true)
        .flag("DeepInheritance", deepInheritance, true)
        .flag("IncludeQualifiers", includeQualifiers, false)
        .flag("IncludeClassOrigin", includeClassOrigin, false)
        .propertyList(propertyList);
    return readInstances(*fRep, makeRequest(call));
}

Array<CIMObjectPath> CIMClient::enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    IntrinsicCall call("EnumerateInstanceNames", nameSpace);
    call.className("ClassName", className);
    return readAll(*fRep, makeRequest(call), &ElementDecoder::decodeInstanceName);
}

CIMObjectPath CIMClient::createInstance(const CIMNamespaceName& nameSpace, const CIMInstance& newInstance)
{
    IntrinsicCall call("CreateInstance", nameSpace);
    call.newInstance(newInstance);
    return readOne(*fRep, makeRequest(call), "INSTANCENAME", &ElementDecoder::decodeInstanceName);
}

void CIMClient::modifyInstance(const CIMNamespaceName& nameSpace, const CIMInstance& modifiedInstance,
                               Boolean includeQualifiers, const CIMPropertyList& propertyList)
{
    IntrinsicCall call("ModifyInstance", nameSpace);
    call.modifiedInstance(modifiedInstance)
        .flag("IncludeQualifiers", includeQualifiers, true)
        .propertyList(propertyList);
    readNothing(*fRep, makeRequest(call));
}

void CIMClient::deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& instanceName)
{
    IntrinsicCall call("DeleteInstance", nameSpace);
    call.instanceName(instanceName);
    readNothing(*fRep, makeRequest(call));
}

CIMQualifierDecl CIMClient::getQualifier(const CIMNamespaceName& nameSpace, const CIMName& qualifierName)
{
    IntrinsicCall call("GetQualifier", nameSpace);
    call.text("QualifierName", qualifierName.getString());
    return readOne(*fRep, makeRequest(call), "QUALIFIER.DECLARATION", &ElementDecoder::decodeQualifierDeclaration);
}

Array<CIMQualifierDecl> CIMClient::enumerateQualifiers(const CIMNamespaceName& nameSpace)
{
    IntrinsicCall call("EnumerateQualifiers", nameSpace);
    return readAll(*fRep, makeRequest(call), &ElementDecoder::decodeQualifierDeclaration);
}

void CIMClient::setQualifier(const CIMNamespaceName& nameSpace, const CIMQualifierDecl& qualifierDeclaration)
{
    IntrinsicCall call("SetQualifier", nameSpace);
    call.qualifierDeclaration(qualifierDeclaration);
    readNothing(*fRep, makeRequest(call));
}

CIMValue CIMClient::invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& instanceName,
                                 const CIMName& methodName, const Array<CIMParamValue>& inParameters,
                                 Array<CIMParamValue>& outParameters)
{
    CIMValue returnValue;
    Array<CIMParamValue> outputs;
    bool hasReturned = false;
    fRep->exchange(client::makeMethodRequest(nameSpace, instanceName, methodName, inParameters),
                   [&](const XmlElement& element, ElementDecoder& decoder) {
                       if (!hasReturned && element.is("RETURNVALUE")) {
                           returnValue = decoder.decodeReturnValue(element);
                           hasReturned = true;
                       } else {
                           outputs.append(asOutput(decoder.decodeParamValue(element)));
                       }
                   });
    outParameters = outputs;
    return returnValue;
}

} // namespace Pegasus
