// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/formats/JsonValues.h"

#include <string>
#include <vector>

namespace vrxhost {

// Makes the text of one JSON value member by member, laid out as JsonText lays out the whole. Objects and arrays that
// have begun are open until they are closed; members and elements go to the innermost one.
class TJsonWriter
{
  public:
    // A member of an object; an element of an array has an empty name.
    void Add(const std::string& name, const TJson& value);
    void AddMembers(const TJson& object);

    void BeginObject(const std::string& name = "") { Begin(name, '{', '}'); }
    void BeginArray(const std::string& name) { Begin(name, '[', ']'); }

    // Closes what has begun until depth objects and arrays are open.
    void CloseTo(std::size_t depth);
    std::size_t GetDepth() const { return fOpen.size(); }

    // Returns: the text since the last call.
    std::string Take();

  private:
    struct TOpen
    {
        char fEnd;
        bool fIsEmpty;
    };

    void Begin(const std::string& name, char begin, char end);
    void BeginItem(const std::string& name);
    std::string NewLine() const;

    std::vector<TOpen> fOpen;
    std::string fText;
};

} // namespace vrxhost
