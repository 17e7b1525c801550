#pragma once

#include <string>

// Who can change what a program is about to run, as sshd's StrictModes asks.
// Thread: any.
namespace Pegasus::base {

// A path is owned when nobody but root and the process's effective user can change what it names:
//   - the file or folder that it names, links resolved, is root's or the user's own, and neither its group nor others
//     may write it;
//   - so is every folder above it, on the way as written and on the way that links lead. There the sticky bit, as in
//     /tmp, makes up for the right to write.
// A group counts as the user when it is the user's private one: it has the user's name and no other member. The same
// holds for root's.
//
// Returns: empty when the path is owned, or names nothing; else what can be changed by whom:
//   "/opt/tree/bin (owner nobody, mode 0755) can be changed by users other than root".
std::string ownershipFault(const std::string& path);

} // namespace Pegasus::base
