#pragma once

#include "tests/support/ScriptedPeer.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMQualifierDecl.h>
#include <Pegasus/Common/Exception.h>

#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace test {

// ---- HTTP around a body

// 200 with a content-length.
PeerAnswer httpAnswer(const std::string& body);
// 200 in chunks of at most `chunkBytes`, with `trailer` ("Name: value\r\n" lines) behind them.
PeerAnswer chunkedAnswer(const std::string& body, std::size_t chunkBytes, const std::string& trailer = std::string());
// Another status than 200; `fields` are whole header lines.
PeerAnswer httpErrorAnswer(unsigned status, const std::string& reason, const std::string& fields = std::string());

// ---- CIM-XML that answers a request

// The answer's XML: `content` goes into IRETURNVALUE.
std::string intrinsicBody(const PeerRequest& request, const std::string& content);
// The same without an IRETURNVALUE.
std::string intrinsicBodyWithout(const PeerRequest& request);
std::string errorBody(const PeerRequest& request, unsigned code, const std::string& description);
std::string extrinsicBody(const PeerRequest& request, const std::string& content);

PeerAnswer classAnswer(const PeerRequest& request, const Pegasus::CIMClass& cimClass);
PeerAnswer instancesAnswer(const PeerRequest& request, const std::vector<Pegasus::CIMInstance>& instances);
PeerAnswer qualifierAnswer(const PeerRequest& request, const Pegasus::CIMQualifierDecl& declaration);
PeerAnswer methodAnswer(const PeerRequest& request, const Pegasus::CIMValue& returnValue,
                        const std::vector<Pegasus::CIMParamValue>& outputs = {});
// A CIM error, in the body and with a content-length; or in the trailer behind an empty answer, as servers send it to
// a client that asks for trailers.
PeerAnswer errorAnswer(const PeerRequest& request, unsigned code, const std::string& description);
PeerAnswer trailerErrorAnswer(const PeerRequest& request, unsigned code, const std::string& description);

// ---- faults made of a good answer

PeerAnswer inPieces(PeerAnswer answer, std::size_t pieceBytes, std::chrono::milliseconds pause = {});
// Only the first `bytes`, then the connection is closed.
PeerAnswer cutAt(PeerAnswer answer, std::size_t bytes);
// A content-length that is `difference` off; then the connection is closed.
PeerAnswer withWrongLength(const PeerAnswer& answer, int difference);
// Every `from` in the answer replaced; the content-length is not adjusted, so keep the size for bodies.
PeerAnswer withReplaced(PeerAnswer answer, const std::string& from, const std::string& to);
PeerAnswer noAnswer();
PeerAnswer closedConnection();
PeerAnswer notHttp();

// A server made of objects: what is not in it is answered with the CIM status that a server would send.
// Requires: filled before the peer starts, or only changed between requests.
class ServedModel
{
  public:
    using Method = std::function<PeerAnswer(const PeerRequest&)>;

    ServedModel& addClass(const std::string& nameSpace, const Pegasus::CIMClass& cimClass);
    // Under the instance's own class. Its path should have keys.
    ServedModel& addInstance(const std::string& nameSpace, const Pegasus::CIMInstance& instance);
    ServedModel& addQualifier(const std::string& nameSpace, const Pegasus::CIMQualifierDecl& declaration);
    // An extrinsic method, whatever it is called on.
    ServedModel& addMethod(const std::string& name, Method method);
    // Played instead of the next answers to `method` ("GetClass"), one for each request.
    ServedModel& addFault(const std::string& method, Method fault);

    PeerAnswer answer(const PeerRequest& request);
    // For ScriptedPeer's constructor. The model must outlive the peer.
    PeerHandler handler()
    {
        return [this](const PeerRequest& request) { return answer(request); };
    }

  private:
    PeerAnswer answerIntrinsic(const PeerRequest& request);

    mutable std::mutex fMutex;
    // Keys are lower-case "namespace:name".
    std::map<std::string, Pegasus::CIMClass> fClasses;
    std::map<std::string, std::vector<Pegasus::CIMInstance>> fInstances;
    std::map<std::string, Pegasus::CIMQualifierDecl> fQualifiers;
    std::map<std::string, Method> fMethods;
    std::map<std::string, std::vector<Method>> fFaults;
};

} // namespace test
