// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::path {

enum class KeyKind
{
    kBoolean,
    kString,
    kNumeric,
    kReference
};

struct Key
{
    std::string name;
    std::string value;
    KeyKind kind = KeyKind::kString;
};

// The parts of an object path's text, in UTF-8.
struct Parts
{
    std::string host;
    std::string nameSpace;
    std::string className;
    std::vector<Key> keys;
};

// `//host/namespace:Class.key=value,...`. A quoted value that is itself a path with keys is a reference.
// Returns: empty when the text is well formed, else what is wrong with it.
std::string parse(std::string_view text, Parts& parts);

// A host name, dotted name, IPv4 or [IPv6] address, each with an optional :port.
bool isHost(std::string_view text);

} // namespace Pegasus::path
