// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMName.h>

#include <functional>
#include <map>
#include <string>
#include <string_view>

namespace Pegasus::wire {

// Names by their UTF-8 text: each is checked and converted once, and all its users share one text. It holds a bounded
// number of names of a bounded length.
// Thread: one thread at a time.
class NameCache
{
  public:
    // Returns: the name; valid until the next call. Throws: InvalidNameException; Exception on invalid UTF-8.
    const CIMName& name(std::string_view utf8);

  private:
    std::map<std::string, CIMName, std::less<>> fNames;
    CIMName fLongName;
};

} // namespace Pegasus::wire
