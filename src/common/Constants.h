// SPDX-License-Identifier: MIT
// Texts that several concerns of the plug-in share.
#pragma once

#include <string>

namespace NKOLVRX20 {

// The default timeout, in seconds.
inline const std::string strTimeout = "60";

// Milliseconds that a question for a class or a qualifier declaration may take, whatever timeout the client had before.
inline constexpr unsigned int kGetClassTimeoutMs = 5000;

// The one CIM namespace that the plug-in offers; also the default server namespace of a class.
inline const std::string kDefaultCimNamespace = "root/cimv2";

// The pseudo-class above every top-level class.
inline const std::string kRootClassName = "<root>";

// The tag of a class that is fetched, but left out when classes are offered to the host.
inline const std::string kCdmTag = "CDM";

// Context keys that name a class's server namespace and its timeout in seconds; both hold strings.
inline const std::string kNspKey = "nsp";
inline const std::string kTimeoutKey = "timeout";

// The radix in which numbers are written and read.
inline constexpr unsigned char kDecimal = 10;

// The qualifier of a property or method that takes the place of an inherited one.
inline constexpr char kOverrideQualifier[] = "OVERRIDE";

} // namespace NKOLVRX20
