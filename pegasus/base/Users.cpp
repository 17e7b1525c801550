// SPDX-License-Identifier: MIT
#include "pegasus/base/Users.h"

#include <vector>

#include <pwd.h>
#include <unistd.h>

namespace Pegasus::base {

std::string userName(uid_t user)
{
    std::vector<char> space(kMaxDatabaseEntryBytes);
    passwd entry = {};
    passwd* found = nullptr;
    return ::getpwuid_r(user, &entry, space.data(), space.size(), &found) == 0 && found != nullptr
               ? found->pw_name
               : std::to_string(user);
}

bool isTrustedUser(std::optional<uid_t> user)
{
    return user && (*user == 0 || *user == ::geteuid());
}

} // namespace Pegasus::base
