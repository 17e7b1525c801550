#pragma once

#include <host/HostFwd.h>
#include <host/ILogger.h>
#include <host/INamespaceProviderManager.h>

#include <boost/shared_ptr.hpp>

namespace NKOLVRX20 {

// The host's process-wide services.
// Thread: safe.
class TRootObject
{
  public:
    // Returns: the core logger, never null. Ownership: the host's, for the life of the process.
    static ILogger* GetCoreLogger();

    // Takes another logger's place; null restores the host's own. Returns: the one replaced, null for the own.
    // Ownership: the caller's; it must outlive its use as core logger.
    static ILogger* SetCoreLogger(ILogger* logger);

    static boost::shared_ptr<INamespaceProviderManager> GetNamespaceProviderManager();
};

} // namespace NKOLVRX20
