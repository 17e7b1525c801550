// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

namespace Pegasus::wire {

// Bounds on XML that comes from a socket, far above what real messages need. Each has an error of its own.
struct XmlLimits
{
    // Elements open at once.
    std::size_t maxDepth = 64;
    // Attributes of one element.
    std::size_t maxAttributes = 32;
    // Bytes of one tag, comment or processing instruction.
    std::size_t maxTagBytes = 64UL * 1024;
    // Bytes of character data in one element, as they stand in the message.
    std::size_t maxTextBytes = 16UL * 1024 * 1024;
    // Bytes of one element that is decoded as a whole (an instance, a class).
    std::size_t maxElementBytes = 64UL * 1024 * 1024;
    // Elements in it, itself included. A reader has 32 bytes for each, which may be eight times its text.
    std::size_t maxElements = 4UL * 1024 * 1024;
    // Elements of one array value.
    std::size_t maxArrayElements = 1024UL * 1024;
    // Members of one owner and kind: properties, methods or qualifiers of a class, parameters of a method.
    std::size_t maxMembers = 16384;
    // Key bindings of one object path, nested ones excluded.
    std::size_t maxKeyBindings = 256;
    // Embedded objects in embedded objects.
    std::size_t maxEmbedding = 8;
    // Bytes in memory of the objects that a client decodes one answer into, by ElementDecoder::decodedBytes().
    std::size_t maxDecodedBytes = 256UL * 1024 * 1024;
};

} // namespace Pegasus::wire
