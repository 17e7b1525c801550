// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/TokenCursor.h"

#include <cstddef>
#include <set>
#include <string>

namespace Pegasus::mof {

// What such a warning begins with.
inline constexpr char kPortabilityMark[] = "works here, fails on OpenPegasus 2.14: ";

// Reports texts that this compiler accepts and OpenPegasus 2.14's refuses, so that a vendor who develops here learns of
// them: a warning once per kind and compilation, an error when the check is strict.
class Portability
{
  public:
    explicit Portability(bool isStrict) : fIsStrict(isStrict) {}

    // Returns: whether report() would still say something of this kind. Whoever must ask the handler to find such a
    //     text asks this first.
    bool isNews(const std::string& kind) const { return fIsStrict || fReported.count(kind) == 0; }

    // `kind`: the text as a noun phrase without names; the place says which one it is.
    // Throws: MofError when the check is strict.
    void report(const TokenCursor& cursor, std::size_t offset, const std::string& kind)
    {
        if (fIsStrict) {
            cursor.failAt(offset, "fails on OpenPegasus 2.14: " + kind);
        }
        if (fReported.insert(kind).second) {
            cursor.warn(offset, kPortabilityMark + kind);
        }
    }

  private:
    bool fIsStrict;
    std::set<std::string> fReported;
};

} // namespace Pegasus::mof
