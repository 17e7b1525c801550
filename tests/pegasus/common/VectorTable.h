#pragma once

#include <Pegasus/Common/CIMObject.h>

#include <nlohmann/json.hpp>

#include <functional>
#include <map>
#include <string>

namespace test {

using nlohmann::json;

// One recorded answer of the real library.
struct Vector
{
    std::string id;
    std::string input;

    // The text in quotes in the input, its escapes resolved.
    std::string quoted() const;
    // Returns: the id after its last dot.
    std::string lastWord() const;
};

// What computes the same here. A name stands for the vector of that id; one that ends in a dot for all that begin so.
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
