// SPDX-License-Identifier: MIT
#pragma once

// Platform check, linkage macros and the basic types that every public header builds on.

#if !defined(PEGASUS_PLATFORM_LINUX_X86_64_GNU)
#error "Unsupported Platform: compile with -DPEGASUS_PLATFORM_LINUX_X86_64_GNU"
#endif

#include <iosfwd>

#define PEGASUS_EXPORT __attribute__((visibility("default")))
#define PEGASUS_IMPORT __attribute__((visibility("default")))
#define PEGASUS_COMMON_LINKAGE PEGASUS_EXPORT
#define PEGASUS_CLIENT_LINKAGE PEGASUS_EXPORT

#define PEGASUS_NAMESPACE_BEGIN namespace Pegasus {
#define PEGASUS_NAMESPACE_END }
#define PEGASUS_NAMESPACE(X) Pegasus::X
#define PEGASUS_STD(X) std::X
#define PEGASUS_USING_PEGASUS using namespace Pegasus
#define PEGASUS_USING_STD using namespace std

#define PEGASUS_64BIT_CONVERSION_WIDTH "ll"
#define PEGASUS_UINT64_LITERAL(X) X##ULL
#define PEGASUS_SINT64_LITERAL(X) X##LL
#define PEGASUS_UNREACHABLE(CODE) CODE
#define PEGASUS_FORMAT(FORMAT_INDEX, FIRST_ARGUMENT) __attribute__((format(printf, FORMAT_INDEX, FIRST_ARGUMENT)))

// Returned by searches that fail.
#define PEG_NOT_FOUND (Pegasus::Uint32(-1))

PEGASUS_NAMESPACE_BEGIN

using Boolean = bool;
using Uint8 = unsigned char;
using Sint8 = signed char;
using Uint16 = unsigned short;
using Sint16 = short;
using Uint32 = unsigned int;
using Sint32 = int;
using Uint64 = unsigned long long;
using Sint64 = long long;
using Real32 = float;
using Real64 = double;

PEGASUS_NAMESPACE_END
