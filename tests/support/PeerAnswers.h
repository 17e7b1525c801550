// SPDX-License-Identifier: MIT
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
// 200 in chunks of at most `chunkBytes`, followed by `trailer` ("Name: value\r\n" lines).
PeerAnswer chunkedAnswer(const std::string& body, std::size_t chunkBytes, const std::string& trailer = std::string());
// A status other than 200; `fields` are whole header lines.
PeerAnswer httpErrorAnswer(unsigned status, const std::string& reason, const std::string& fields = std::string());

// ---- CIM-XML that answers a request

// The answer's XML: `content` goes into IRETURNVALUE.
std::string intrinsicBody(const PeerRequest& request, const std::string& content);
// The same with the IRETURNVALUE left out.
std::string intrinsicBodyWithout(const PeerRequest& request);
std::string errorBody(const PeerRequest& request, unsigned code, const std::string& description);
std::string extrinsicBody(const PeerRequest& request, const std::string& content);

PeerAnswer classAnswer(const PeerRequest& request, const Pegasus::CIMClass& cimClass);
PeerAnswer instancesAnswer(const PeerRequest& request, const std::vector<Pegasus::CIMInstance>& instances);
PeerAnswer qualifierAnswer(const PeerRequest& request, const Pegasus::CIMQualifierDecl& declaration);
PeerAnswer methodAnswer(const PeerRequest& request, const Pegasus::CIMValue& returnValue,
                        const std::vector<Pegasus::CIMParamValue>& outputs = {});
// A CIM error: in the body, with a content-length; or in the trailer after an empty body, as servers send it to a
// client that asks for trailers.
PeerAnswer errorAnswer(const PeerRequest& request, unsigned code, const std::string& description);
PeerAnswer trailerErrorAnswer(const PeerRequest& request, unsigned code, const std::string& description);

// ---- faults made of a good answer

PeerAnswer inPieces(PeerAnswer answer, std::size_t pieceBytes, std::chrono::milliseconds pause = {});
// Only the first `bytes`, then the connection is closed.
PeerAnswer cutAt(PeerAnswer answer, std::size_t bytes);
// A content-length that is `difference` off; then the connection is closed.
PeerAnswer withWrongLength(const PeerAnswer& answer, int difference);
// Every `from` in the answer replaced. The content-length stays, so a replacement in a body must keep the size.
PeerAnswer withReplaced(PeerAnswer answer, const std::string& from, const std::string& to);
PeerAnswer noAnswer();
PeerAnswer closedConnection();
PeerAnswer notHttp();

// Answers from the objects that it holds; a request for any other object gets the CIM status that a server would send.
// Requires: it is filled before the peer starts, and changed between requests only.
class ServedModel
{
  public:
    using Method = std::function<PeerAnswer(const PeerRequest&)>;

    ServedModel& addClass(const std::string& nameSpace, const Pegasus::CIMClass& cimClass);
    // Adds the instance to its class. Requires: its path has keys.
    ServedModel& addInstance(const std::string& nameSpace, const Pegasus::CIMInstance& instance);
    ServedModel& addQualifier(const std::string& nameSpace, const Pegasus::CIMQualifierDecl& declaration);
    // An extrinsic method, for every object.
    ServedModel& addMethod(const std::string& name, Method method);
    // Replaces one of the next answers to `method` ("GetClass"); several faults replace one answer each.
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
