#ifndef PEGASUS_COMMON_NAMEACCESS_H
#define PEGASUS_COMMON_NAMEACCESS_H

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/Exception.h>

namespace Pegasus {

struct NameAccess
{
    /// Do the two share one text? Equal names of one message usually do.
    static bool shareText(const CIMName& name1, const CIMName& name2) noexcept
    {
        return name1.fName.getChar16Data() == name2.fName.getChar16Data();
    }
};

/// Returns: the name. Throws: UninitializedObjectException when it is null.
inline const CIMName& notNull(const CIMName& name)
{
    if (name.isNull())
        throw UninitializedObjectException();
    return name;
}

} // namespace Pegasus

#endif
