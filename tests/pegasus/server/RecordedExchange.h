// SPDX-License-Identifier: MIT
#pragma once

#include "tests/pegasus/server/HttpExchange.h"

#include <string>
#include <vector>

namespace servertest {

// A request and its answer as they once went over the wire. What it is about
// comes from its content; its name is for messages.
struct RecordedExchange
{
    // Reads request.http, response.http and note.md of the folder. Throws:
    // std::runtime_error when one is absent.
    explicit RecordedExchange(const std::string& folder);

    // Returns: whether the request's parameter of this name has the value;
    // `ifMissing` when it was left out.
    bool flag(const std::string& name, bool ifMissing) const;
    bool hasParameter(const std::string& name) const;
    bool hasFailed() const { return answer.status != 200 || answer.trailers.count("cimstatuscode") != 0; }
    // Returns: the CIM status; 0 without one.
    int status() const;

    std::string name;
    std::string request;
    HttpAnswer answer;
    std::string note;
    std::string method;
    std::string nameSpace;
    std::string className; // the class that it asks about; empty without one
    bool isRaw = false;    // bytes of no client
    std::string session;   // of a tool that sent several messages: the tool's description
    int message = 0;       // the message's number in its session
};

// All recordings of the folder but those with made-up answers, in the order of
// their names; empty when the build has no folder.
const std::vector<RecordedExchange>& recordings();

// Returns: the first group of the first match; empty without one.
std::string firstMatch(const std::string& text, const std::string& pattern);

// The elements of one name in a body, each as text with the line feed after it.
// They do not nest.
std::vector<std::string> elementsOf(const std::string& body, const std::string& element);

enum class Order
{
    kAsSent,
    // Instances and their properties by their texts: providers answer in any order, and a CMPI instance has the order
    // of its class. Null properties, PROPAGATED, ARRAYSIZE and blanks at the ends of text
    // are left out: the recorded provider in C++ differs there.
    kSorted
};

// A body in canonical form: blanks between tags, the order of attributes and
// the escapes of characters are evened out.
std::string canonicalBody(std::string body, Order order);
// Status, CIM headers, trailer and body of an answer, one a line, in the same
// canonical form.
std::string canonical(const HttpAnswer& answer, Order order = Order::kAsSent);

// The line where two texts part, with a few that follow; empty if they are
// equal.
std::string firstDifference(const std::string& ours, const std::string& recorded);

} // namespace servertest
