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

// Returned by searches that find nothing.
#define PEG_NOT_FOUND (Pegasus::Uint32(-1))

PEGASUS_NAMESPACE_BEGIN

typedef bool Boolean;
typedef unsigned char Uint8;
typedef signed char Sint8;
typedef unsigned short Uint16;
typedef short Sint16;
typedef unsigned int Uint32;
typedef int Sint32;
typedef unsigned long long Uint64;
typedef long long Sint64;
typedef float Real32;
typedef double Real64;

PEGASUS_NAMESPACE_END
