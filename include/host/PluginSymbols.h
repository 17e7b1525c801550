// SPDX-License-Identifier: MIT
// The symbols by which a host finds a namespace-provider plug-in's entry points after dlopen with RTLD_NOW |
// RTLD_LOCAL. Both functions take nothing and return nothing: void (*)().
#pragma once

namespace NKOLVRX20 {

// TPEGASUSNamespaceProvider::Initialize(): registers the plug-in's INamespaceProvider with the host's manager.
// Throws: what the manager's RegisterNamespaceProvider throws.
inline constexpr const char kInitializeSymbol[] = "_ZN9NKOLVRX2025TPEGASUSNamespaceProvider10InitializeEv";

// TPEGASUSNamespaceProvider::ClearNamespace(): releases the plug-in's current namespace, if any. The
// last owner's release ends it (ICIMNamespace): a pointer that the host still holds postpones that.
// Blocks: for the namespace's end.
inline constexpr const char kClearNamespaceSymbol[] = "_ZN9NKOLVRX2025TPEGASUSNamespaceProvider14ClearNamespaceEv";

} // namespace NKOLVRX20
