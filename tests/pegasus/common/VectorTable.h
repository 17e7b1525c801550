// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMObject.h>

#include <nlohmann/json.hpp>

#include <functional>
#include <map>
#include <string>
#include <vector>

namespace test {

using nlohmann::json;

// One recorded answer of the real library.
struct Vector
{
    std::string id;
    std::string input;
    std::vector<std::string> arguments; // what the asterisks of the evaluator's name stand for

    // The text in quotes in the input, its escapes resolved.
    std::string quoted() const;
    // An argument as a number: decimal, or hexadecimal after 0x.
    unsigned long long number(std::size_t index = 0) const { return std::stoull(arguments.at(index), nullptr, 0); }
};

// What computes the same here, by the operation that a vector's input shows. An asterisk in a name stands for an
// argument.
using Evaluator = std::function<json(const Vector&)>;
using VectorTable = std::map<std::string, Evaluator>;

void addNameVectors(VectorTable& table);
void addPathVectors(VectorTable& table);
void addDateTimeVectors(VectorTable& table);
void addExceptionVectors(VectorTable& table);
void addStringVectors(VectorTable& table);
void addFlagVectors(VectorTable& table);
void addValueVectors(VectorTable& table);
void addObjectVectors(VectorTable& table);

std::string utf8(const Pegasus::String& text);
Pegasus::String text(const std::string& utf8);
json describe(const Pegasus::CIMValue& value);
json describe(const Pegasus::CIMObjectPath& path);
json describe(const Pegasus::CIMDateTime& dateTime);

} // namespace test
