// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>

#include <boost/shared_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

class TPEGASUSClass;
class TPEGASUSInstance;

// Makes the host's instance of a class from the server's. A property that fails to convert is left out and logged
// under the name of the operation that asked.
// Throws: boost::bad_weak_ptr when the namespace is gone; Pegasus::Exception for an unreadable instance.
// Blocks: for each reference property to a class that is new to the namespace, as long as its GetClass.
boost::shared_ptr<TPEGASUSInstance> BuildInstance(TPEGASUSClass& instanceClass, const Pegasus::CIMInstance& source,
                                                  const std::string& operation);

} // namespace NKOLVRX20
