#pragma once

#include <Pegasus/Common/CIMName.h>

#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// Names by their UTF-8 text: each is checked and converted once, and all its users share one text.
// It holds a bounded number of names; a rarely used one is dropped for a new one.
class NameCache
{
  public:
    NameCache();
    ~NameCache();

    // Returns: the name; valid until the next call. Throws: InvalidNameException; Exception when it is not UTF-8.
    const CIMName& name(std::string_view utf8);

  private:
    struct Entry;

    std::vector<Entry> fEntries;
    CIMName fLongName;
};

} // namespace Pegasus::wire
