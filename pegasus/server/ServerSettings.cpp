// SPDX-License-Identifier: MIT
#include "pegasus/server/ServerSettings.h"

namespace Pegasus::server {

LogLevel logLevel(const Config& config)
{
    const std::string level = config.text("logLevel");
    return level == "ERROR"     ? LogLevel::kError
           : level == "WARNING" ? LogLevel::kWarning
           : level == "DEBUG"   ? LogLevel::kDebug
                                : LogLevel::kInformation;
}

ConnectionSettings connectionSettings(const Config& config)
{
    ConnectionSettings settings;
    settings.http = {config.number("maxHeaderBytes"), config.number("maxBodyBytes")};
    settings.times = {config.seconds("idleConnectionTimeout"), config.seconds("requestReadTimeout")};
    settings.writeTimeout = config.seconds("socketWriteTimeout");
    settings.maxXmlDepth = config.number("maxXmlDepth");
    settings.maxBufferedAnswerBytes = config.number("maxBufferedAnswerBytes");
    settings.strictHosts = config.flag("strictHosts");
    return settings;
}

AgentSettings agentSettings(const Config& config)
{
    AgentSettings settings;
    settings.providerDirectories = config.directories("providerDir");
    settings.timeout = config.seconds("providerTimeout");
    settings.idle = config.seconds("agentIdleTimeout");
    settings.confinement.memoryMegabytes = config.number("agentMemoryMegabytes");
    settings.confinement.fileMegabytes = config.number("agentFileMegabytes");
    settings.confinement.coreMegabytes = config.number("agentCoreMegabytes");
    settings.confinement.processes = config.number("agentProcesses");
    settings.confinement.newPrivileges = config.flag("agentNewPrivileges");
    settings.confinement.capabilities = parseCapabilities(config.text("agentCapabilities")).value_or(0);
    settings.confinement.strictOwners = config.flag("strictOwners");
    settings.confinement.strictProviders = config.flag("strictProviders");
    return settings;
}

std::string repositoryPath(const Config& config)
{
    const std::string directory = config.text("repositoryDir");
    return directory[0] == '/' ? directory : config.home() + "/" + directory;
}

} // namespace Pegasus::server
