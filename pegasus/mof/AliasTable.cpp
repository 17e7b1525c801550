#include "pegasus/mof/AliasTable.h"

#include "pegasus/mof/Token.h"

namespace Pegasus::mof {

const CIMObjectPath* AliasTable::find(const std::string& name) const
{
    const auto found = fPaths.find(toLower(name));
    return found == fPaths.end() ? nullptr : &found->second;
}

bool AliasTable::define(const std::string& name, const CIMObjectPath& path)
{
    return fPaths.emplace(toLower(name), path).second;
}

} // namespace Pegasus::mof
