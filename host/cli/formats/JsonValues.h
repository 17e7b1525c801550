// SPDX-License-Identifier: MIT
// Parts that the formats on JSON share.
#pragma once

#include "host/cli/formats/IFormat.h"

#include <nlohmann/json.hpp>

namespace vrxhost {

using TJson = nlohmann::ordered_json;

// Of the JSON document and of the NDJSON records; docs/schema describes both. It grows when a member changes its
// meaning.
constexpr int kFormatVersion = 2;

// Returns: true types: numbers (64 bits exact), booleans, null, arrays; datetimes and references as strings, a char16
// as a string of one character, an infinite or invalid real as "Infinity", "-Infinity" or "NaN".
TJson JsonValue(const NKOLVRX20::TCIMValue& value);

// Returns: an object with the kept properties by name.
TJson JsonProperties(const TClassRecord& each, const TInstanceRecord& instance, const TFormatOptions& options);

// Returns: an array with what the class declares about each property.
TJson JsonDeclarations(const TClassRecord& each);

TJson JsonHost(const THostFacts& host);

// Adds "partial" to a provider or a class that was given up.
template <typename Record> void MarkPartial(TJson& json, const Record& record)
{
    if (record.fIsPartial) {
        json["partial"] = true;
    }
}

// Adds "complete", "losses" and "notes".
void AddLosses(TJson& json, const TDocument& document);

// Returns: JSON text; bytes outside UTF-8 become U+FFFD. indent: -1 for one line.
std::string JsonText(const TJson& json, int indent);

} // namespace vrxhost
