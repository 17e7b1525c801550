// SPDX-License-Identifier: MIT
// The files in page/, which the build embeds, and the base64 of their SHA-256, by which the page's policy allows them.
#pragma once

namespace vrxhost {

extern const char kPageStyle[];
extern const char kPageStyleHash[];
extern const char kPageScript[];
extern const char kPageScriptHash[];

} // namespace vrxhost
