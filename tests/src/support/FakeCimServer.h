// SPDX-License-Identifier: MIT
#pragma once

#include "tests/support/ScriptedPeer.h"

#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// Returns: a request's operation and object: "GetClass CIM_Foo", "GetQualifier Key", "EnumerateInstances CIM_Foo".
std::string RequestName(const test::PeerRequest& request);

// A CIM server on a loopback port that answers from a script. It has its port from the start, but refuses connections
// until Listen.
// Requests go by their RequestName. A request that the script lacks is answered with CIM error 6.
// Thread: safe.
class TFakeCimServer
{
  public:
    TFakeCimServer();

    unsigned short Port() const { return fPeer.port(); }
    void Listen() { fPeer.listen(); }
    // Ends the connections that stand, and refuses further ones.
    void Refuse() { fPeer.refuse(); }

    // The content of the answer's IRETURNVALUE.
    void Answer(const std::string& request, const std::string& returnValue);
    // A class with these elements.
    void AnswerClass(const std::string& name, const std::string& superClass, const std::string& elements = "");
    void AnswerWith(const std::string& request, test::PeerHandler handler);

    std::vector<std::string> Requests() const;
    // Returns: how often this was asked.
    long Count(const std::string& request) const;
    // Returns: the bodies of the requests of that name.
    std::vector<std::string> Bodies(const std::string& request) const;

  private:
    test::PeerAnswer Respond(const test::PeerRequest& request);

    mutable std::mutex fMutex;
    std::map<std::string, test::PeerHandler> fHandlers; // by request name
    test::ScriptedPeer fPeer;
};

} // namespace NKOLVRX20
