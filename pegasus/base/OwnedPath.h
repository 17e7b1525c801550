// SPDX-License-Identifier: MIT
#pragma once

#include <string>

// Who can change what a program is about to run, as sshd's StrictModes asks.
// Thread: any.
namespace Pegasus::base {

// A path is owned when only root and the process's effective user can change what it names:
//   - the file or folder that it names, links resolved, is root's or the user's, and only its owner may write it;
//   - so is every folder on the way: of the path as written, and of each link's target. In these the sticky bit, as in
//     /tmp, makes up for the right to write.
// A group counts as the user when it is the user's private one: the primary group of that user and of nobody else, with
// no other member. The same holds for root's.
//
// Returns: empty when the path is owned, or is absent; else which part of it can be changed by others:
//   "/opt/tree/bin (owner nobody, mode 0755) can be changed by users other than root".
std::string ownershipFault(const std::string& path);

} // namespace Pegasus::base
