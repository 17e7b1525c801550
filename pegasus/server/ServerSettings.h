// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/server/admin/Config.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/agent/AgentPool.h"
#include "pegasus/server/net/RequestLoop.h"

#include <mutex>

// What the layers below need of the configuration, in their own terms.
// Thread: any.
namespace Pegasus::server {

LogLevel logLevel(const Config& config);
ConnectionSettings connectionSettings(const Config& config);
AgentSettings agentSettings(const Config& config);
// Returns: the full path of the repository's folder.
std::string repositoryPath(const Config& config);

// Settings made from the configuration, and again when it has changed: they are asked for at every request.
// Thread: any.
template <typename Settings> class SettingsCache
{
  public:
    SettingsCache(const Config& config, Settings (*make)(const Config&)) : fConfig(config), fMake(make) {}

    Settings get()
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        const unsigned generation = fConfig.generation();
        if (generation != fGeneration) {
            fSettings = fMake(fConfig);
        }
        fGeneration = generation;
        return fSettings;
    }

  private:
    const Config& fConfig;
    Settings (*fMake)(const Config&);
    std::mutex fMutex;
    unsigned fGeneration = 0;
    Settings fSettings;
};

} // namespace Pegasus::server
