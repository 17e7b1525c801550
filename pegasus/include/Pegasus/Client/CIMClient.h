// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClientException.h>
#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMQualifierDecl.h>
#include <Pegasus/Common/CIMValue.h>
#include <Pegasus/Common/Config.h>
#include <Pegasus/Common/Exception.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

class CIMClientRep;

// A connection to a CIM server and its operations (CIM-XML over HTTP/1.1, DSP0200).
//
// The connection is kept. When the server closes it, when a call runs out of time or an answer is broken, the client
// stays connected in name and opens a new one at the next operation.
//
// Throws (operations): NotConnectedException; CannotConnectException (also on that reconnection);
// ConnectionTimeoutException; CIMClientMalformedHTTPException, CIMClientHTTPErrorException, CIMClientXmlException,
// CIMClientResponseException; CIMException with the server's status; InvalidNamespaceNameException (null namespace).
// Thread: one thread at a time for each client.
// Blocks: at most the time-out for each call, connecting, sending, waiting and reading together. Only connect() and
// connectLocal() may take longer: looking up a host name, or the name of the process's user, is bounded by the system's
// own settings.
class PEGASUS_CLIENT_LINKAGE CIMClient
{
  public:
    CIMClient();
    // Disconnects.
    ~CIMClient();
    CIMClient(const CIMClient&) = delete;
    CIMClient& operator=(const CIMClient&) = delete;

    // In milliseconds; at first 20000.
    Uint32 getTimeout() const;
    // From the next call on. With 0 every operation ends at once with ConnectionTimeoutException.
    void setTimeout(Uint32 timeoutMilliseconds);

    // Bytes in memory of the objects of one answer, such as all instances of an enumeration; at first 256 MiB. An
    // instance gets objects for its properties when it is asked for them, and then takes up to four times as much.
    // An extension of this library: a program that is to compile against OpenPegasus too does without these two.
    Uint64 getMaxDecodedBytes() const;
    // From the next call on. Beyond it an operation throws CIMClientXmlException, which names maxDecodedBytes.
    void setMaxDecodedBytes(Uint64 bytes);

    // Opens a TCP connection; user and password are only remembered. An empty host is the local machine, an empty host
    // with port 0 the local socket.
    // Throws: AlreadyConnectedException, CannotConnectException, InvalidLocatorException.
    void connect(const String& host, const Uint32 portNumber, const String& userName, const String& password);
    // Connects to the private socket of the server whose tree is named by the environment's PEGASUS_HOME.
    // Throws: AlreadyConnectedException, CannotConnectException.
    void connectLocal();
    void disconnect();

    CIMClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className, Boolean localOnly = true,
                      Boolean includeQualifiers = true, Boolean includeClassOrigin = false,
                      const CIMPropertyList& propertyList = CIMPropertyList());
    Array<CIMClass> enumerateClasses(const CIMNamespaceName& nameSpace, const CIMName& className = CIMName(),
                                     Boolean deepInheritance = false, Boolean localOnly = true,
                                     Boolean includeQualifiers = true, Boolean includeClassOrigin = false);
    Array<CIMName> enumerateClassNames(const CIMNamespaceName& nameSpace, const CIMName& className = CIMName(),
                                       Boolean deepInheritance = false);
    void createClass(const CIMNamespaceName& nameSpace, const CIMClass& newClass);

    CIMInstance getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& instanceName,
                            Boolean localOnly = true, Boolean includeQualifiers = false,
                            Boolean includeClassOrigin = false,
                            const CIMPropertyList& propertyList = CIMPropertyList());
    Array<CIMInstance> enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                          Boolean deepInheritance = true, Boolean localOnly = true,
                                          Boolean includeQualifiers = false, Boolean includeClassOrigin = false,
                                          const CIMPropertyList& propertyList = CIMPropertyList());
    Array<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace, const CIMName& className);
    CIMObjectPath createInstance(const CIMNamespaceName& nameSpace, const CIMInstance& newInstance);
    // The instance at the path of `modifiedInstance` gets its values: all that it has, or those of the listed
    // properties.
    void modifyInstance(const CIMNamespaceName& nameSpace, const CIMInstance& modifiedInstance,
                        Boolean includeQualifiers = true, const CIMPropertyList& propertyList = CIMPropertyList());
    void deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& instanceName);

    CIMQualifierDecl getQualifier(const CIMNamespaceName& nameSpace, const CIMName& qualifierName);
    Array<CIMQualifierDecl> enumerateQualifiers(const CIMNamespaceName& nameSpace);
    void setQualifier(const CIMNamespaceName& nameSpace, const CIMQualifierDecl& qualifierDeclaration);

    // The path's host and namespace are ignored. `outParameters` is replaced.
    CIMValue invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& instanceName,
                          const CIMName& methodName, const Array<CIMParamValue>& inParameters,
                          Array<CIMParamValue>& outParameters);

  private:
    CIMClientRep* fRep;
};

PEGASUS_NAMESPACE_END
