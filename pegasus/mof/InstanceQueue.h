// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Delivery.h"
#include "pegasus/mof/MofError.h"

#include <list>
#include <string>
#include <vector>

namespace Pegasus::mof {

// A reference property whose value is an alias whose path is still unknown.
struct OpenReference
{
    CIMName property;
    std::string alias;
    SourcePlace place;
};

// An instance as parsed, before its open references have values.
struct ParsedInstance
{
    CIMInstance instance;
    CIMClass itsClass;
    std::string alias; // empty: none
    std::vector<OpenReference> open;
    SourcePlace place;
};

// Delivers instances. DSP0004 lets an instance use an alias that is defined further down, in circles
// too. Such an instance waits until the alias has a path, which it has as soon as the keys of its own instance are
// known. Requires: what the constructor takes outlives the queue.
class InstanceQueue
{
  public:
    InstanceQueue(Delivery& delivery, AliasTable& aliases) : fDelivery(delivery), fAliases(aliases) {}

    // Delivers the instance and those that waited for it, or lets it wait.
    // Throws: MofError for an alias that is defined already; what the handler throws.
    void submit(ParsedInstance parsed);
    // Throws: MofError at a reference whose alias is still undefined.
    void finish() const;

  private:
    bool advance(ParsedInstance& parsed);
    bool resolve(ParsedInstance& parsed) const;
    bool nameAlias(ParsedInstance& parsed);
    void settle();

    Delivery& fDelivery;
    AliasTable& fAliases;
    std::list<ParsedInstance> fWaiting;
};

} // namespace Pegasus::mof
