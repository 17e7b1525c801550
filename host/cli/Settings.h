// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace vrxhost {

// Reads the settings file, when there is one, and then the settings of the command line, which go before the file's.
// docs/settings.md lists the keys. A key with a dot, "plugin.key", belongs to another plug-in and is passed on.
// Throws: TUsageError for a line of another form, an unknown key or value, or a file that cannot be read; nothing has
// taken effect then. The sentence begins with "FILE:LINE:".
void LoadSettings(const std::string& file, const std::vector<std::pair<std::string, std::string>>& fromCommandLine);

} // namespace vrxhost
