// Where things lie below the root directory (the server's) and below the module path (the plug-in's).
#pragma once

namespace NKOLVRX20 {

// The server's program, and how a process listing names it.
inline constexpr char kServerName[] = "cimserver";

inline constexpr char kPegasusHome[] = "/pegasus";
inline constexpr char kProgramDirectory[] = "/pegasus/bin/";
inline constexpr char kLibraryDirectory[] = "/pegasus/lib";
inline constexpr char kRepositoryDirectory[] = "/pegasus/repository";
inline constexpr char kProviderDirectory[] = "/pegasus/provider";
inline constexpr char kLsiDirectory[] = "/pegasus/provider/lsi_mir/";
inline constexpr char kSchemaDirectory[] = "/pegasus/pegSchema";

// Parts of the file names by which a vendor announces a provider.
inline constexpr char kClassesExtension[] = ".classes.xml";
inline constexpr char kSpecificationExtension[] = ".properties.mof";
inline constexpr char kRegistrationExtension[] = ".registration.mof";

inline constexpr char kInternalNamespace[] = "root/PG_Internal";
inline constexpr char kInterOpNamespace[] = "root/PG_InterOp";

// Seconds that one of the server's programs may take.
inline constexpr int kProgramTimeoutSeconds = 32767;

} // namespace NKOLVRX20
