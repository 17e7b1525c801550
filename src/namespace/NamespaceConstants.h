// SPDX-License-Identifier: MIT
// Texts and numbers that several concerns of the namespace share.
#pragma once

namespace NKOLVRX20 {

// The port that the server gets when it is free.
inline constexpr unsigned short kPreferredPort = 5988;

// Parts of the file names by which a vendor announces a provider.
inline constexpr char kClassesExtension[] = ".classes.xml";
inline constexpr char kSpecificationExtension[] = ".properties.mof";
inline constexpr char kRegistrationExtension[] = ".registration.mof";

// The server's namespace for the registrations of providers.
inline constexpr char kInterOpNamespace[] = "root/PG_InterOp";

// A context value that should be a sint8, or a string: one message for both.
inline constexpr char kWrongContextTypeText[] =
    "Invalid context pluginType datatype provided to TPluginManagerNamespace::EnumerateProviders(), must be of type "
    "kSint8.";

} // namespace NKOLVRX20
