#pragma once

#include <Pegasus/Common/CIMObjectPath.h>

#include <map>
#include <string>

namespace Pegasus::mof {

// The instance (or class) paths that the aliases of one compilation stand for. Names ignore letter case.
class AliasTable
{
  public:
    // Null if the alias is not defined (yet).
    const CIMObjectPath* find(const std::string& name) const;
    // Returns false if the name is taken.
    bool define(const std::string& name, const CIMObjectPath& path);

  private:
    std::map<std::string, CIMObjectPath> fPaths;
};

} // namespace Pegasus::mof
