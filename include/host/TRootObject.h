// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/ILogger.h>
#include <host/INamespaceProviderManager.h>

#include <boost/shared_ptr.hpp>

namespace NKOLVRX20 {

// The way from a plug-in to the host's process-wide services. An implementer provides GetCoreLogger and
// GetNamespaceProviderManager; both must work while a plug-in's library is being loaded.
// Thread: safe.
class TRootObject
{
  public:
    // Returns: the core logger. Ownership: the host's, for the life of the process; plug-ins ask for each
    // entry.
    static ILogger* GetCoreLogger();

    // Puts another logger in place; null restores the host's own. Returns: the one replaced, null for the host's own.
    // Ownership: the caller's; it must outlive its use as core logger.
    static ILogger* SetCoreLogger(ILogger* logger);

    // Returns: the manager that a plug-in registers its provider with.
    static boost::shared_ptr<INamespaceProviderManager> GetNamespaceProviderManager();
};

} // namespace NKOLVRX20
