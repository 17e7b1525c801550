#pragma once

#include "tests/pegasus/server/HttpExchange.h"

#include <string>
#include <vector>

namespace servertest {

// A request and its answer as they once went over the wire, from the folder of recordings.
struct RecordedExchange
{
    // Throws: std::runtime_error when the recording is absent.
    explicit RecordedExchange(const std::string& name);

    std::string request;
    HttpAnswer answer;
};

// The recordings' folder, with a slash at the end; empty when the build lacks one.
std::string recordingsFolder();

// The elements of one name in a body, each as text with the line feed after it. They do not nest.
std::vector<std::string> elementsOf(const std::string& body, const std::string& element);

enum class Order
{
    kAsSent,
    // Instances and their properties by their texts: providers answer in any order, and a CMPI instance has the order
    // of its class.
    kSorted
};

// A body in canonical form: blanks between tags, the order of attributes and the escapes of characters are evened out.
std::string canonicalBody(std::string body, Order order);
// Status, CIM headers, trailer and body of an answer, one a line, in the same canonical form.
std::string canonical(const HttpAnswer& answer, Order order = Order::kAsSent);

// The line where two texts part, with a few that follow; empty if they are equal.
std::string firstDifference(const std::string& ours, const std::string& recorded);

} // namespace servertest
