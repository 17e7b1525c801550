// SPDX-License-Identifier: MIT
#include "host/core/TCoreLogger.h"
#include "host/core/TNamespaceProviderManager.h"

#include <host/TRootObject.h>

#include <boost/make_shared.hpp>

#include <atomic>

namespace NKOLVRX20 {
namespace {

std::atomic<ILogger*> gCoreLogger{nullptr}; // null: the host's own

} // namespace

ILogger* TRootObject::GetCoreLogger()
{
    ILogger* logger = gCoreLogger.load();
    return logger ? logger : &TCoreLogger::Instance();
}

ILogger* TRootObject::SetCoreLogger(ILogger* logger)
{
    return gCoreLogger.exchange(logger);
}

boost::shared_ptr<INamespaceProviderManager> TRootObject::GetNamespaceProviderManager()
{
    static const boost::shared_ptr<INamespaceProviderManager> fgManager =
        boost::make_shared<TNamespaceProviderManager>();
    return fgManager;
}

} // namespace NKOLVRX20
