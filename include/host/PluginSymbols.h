// The symbols by which a host finds a namespace-provider plug-in's entry points after dlopen.
#pragma once

namespace NKOLVRX20 {

// void TPEGASUSNamespaceProvider::Initialize(): registers the plug-in's provider with the manager.
inline constexpr const char kInitializeSymbol[] = "_ZN9NKOLVRX2025TPEGASUSNamespaceProvider10InitializeEv";

// void TPEGASUSNamespaceProvider::ClearNamespace(): lets the current namespace go.
inline constexpr const char kClearNamespaceSymbol[] = "_ZN9NKOLVRX2025TPEGASUSNamespaceProvider14ClearNamespaceEv";

} // namespace NKOLVRX20
