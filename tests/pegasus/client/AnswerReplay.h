// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/client/CIMClientRep.h"

#include <string>
#include <string_view>
#include <vector>

namespace test {

// An answer and the request that it is for, passed in memory.
struct AnswerCase
{
    std::string name;
    std::string messageId;
    std::string method;
    bool isIntrinsic = true;
    std::string bytes; // the whole HTTP message
};

// How instances are decoded: those with known tags from the text, or each one from its elements.
enum class Decoding
{
    kKnownTags,
    kElements
};

// Reads the answer as the client does, in pieces that end at `cuts`.
// Returns: what was decoded, encoded again; or "EXC class: message"; "incomplete" when the bytes end too early.
std::string readAnswer(const AnswerCase& answer, const std::vector<std::size_t>& cuts = {},
                       const Pegasus::client::ClientLimits& limits = Pegasus::client::ClientLimits(),
                       Decoding decoding = Decoding::kKnownTags);

// Answers with every kind of element, chunks, trailers and errors.
std::vector<AnswerCase> sampleAnswers();

// For each byte of the answer: does it belong to the XML's markup (tags, minus the names and values of attributes) or
// to the framing of chunks? Elsewhere a changed byte is other valid data.
std::vector<bool> markupBytes(std::string_view answer);

} // namespace test
