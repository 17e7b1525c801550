#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/DefinitionHandler.h"
#include "pegasus/mof/MofError.h"

#include <list>
#include <string>
#include <vector>

namespace Pegasus::mof {

// A reference property whose value is an alias that was not defined yet.
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

// Delivers instances to the handler. One that uses an alias from further down (DSP0004 permits it, in circles too)
// waits until that alias has a path; an alias has one as soon as the keys of its instance are known.
class InstanceQueue
{
  public:
    InstanceQueue(DefinitionHandler& handler, AliasTable& aliases) : fHandler(handler), fAliases(aliases) {}

    // Throws MofError for an alias that is taken; passes the handler's exceptions on.
    void submit(ParsedInstance parsed);
    // Throws MofError at a reference whose alias never came.
    void finish() const;

  private:
    bool advance(ParsedInstance& parsed);
    bool resolve(ParsedInstance& parsed) const;
    bool nameAlias(ParsedInstance& parsed);
    void settle();

    DefinitionHandler& fHandler;
    AliasTable& fAliases;
    std::list<ParsedInstance> fWaiting;
};

} // namespace Pegasus::mof
