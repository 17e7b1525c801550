// SPDX-License-Identifier: MIT
#include "pegasus/base/AsciiCase.h"
#include "pegasus/common/NameAccess.h"
#include "pegasus/common/StringRep.h"

namespace Pegasus {
namespace {

bool isLetter(Uint16 unit)
{
    const Uint16 lower = base::lowerAscii(unit);
    return (lower >= 'a' && lower <= 'z') || unit == '_' || (unit >= 0x80 && unit <= 0xFFEF);
}

bool isDigit(Uint16 unit)
{
    return unit >= '0' && unit <= '9';
}

bool isLegalName(const Char16* units, Uint32 count)
{
    if (count == 0 || !isLetter(units[0])) {
        return false;
    }
    for (Uint32 i = 1; i < count; ++i) {
        if (!isLetter(units[i]) && !isDigit(units[i])) {
            return false;
        }
    }
    return true;
}

// Legal names with one "/" between.
bool isLegalNamespace(const Char16* units, Uint32 count)
{
    Uint32 start = 0;
    for (Uint32 i = 0; i <= count; ++i) {
        if (i < count && units[i] != '/') {
            continue;
        }
        if (!isLegalName(units + start, i - start)) {
            return false;
        }
        start = i + 1;
    }
    return true;
}

Uint32 leadingSlash(const String& name)
{
    return name.size() > 0 && name[0] == '/' ? 1 : 0;
}

String checkedName(const String& name)
{
    if (!CIMName::legal(name)) {
        throw InvalidNameException(name);
    }
    return name;
}

String checkedNamespace(const String& name)
{
    if (!CIMNamespaceName::legal(name)) {
        throw InvalidNamespaceNameException(name);
    }
    return leadingSlash(name) ? name.subString(1) : name;
}

} // namespace

CIMName::CIMName(const String& name) : fName(checkedName(name)) {}
CIMName::CIMName(const char* name) : fName(checkedName(name)) {}

CIMName& CIMName::operator=(const String& name)
{
    fName = checkedName(name);
    return *this;
}

Boolean CIMName::equal(const CIMName& name) const
{
    return sameName(*this, name);
}

Boolean CIMName::legal(const String& name)
{
    return isLegalName(name.getChar16Data(), name.size());
}

Boolean operator==(const CIMName& name1, const CIMName& name2)
{
    return name1.equal(name2);
}

Boolean operator!=(const CIMName& name1, const CIMName& name2)
{
    return !name1.equal(name2);
}

CIMNamespaceName::CIMNamespaceName(const String& name) : fName(checkedNamespace(name)) {}
CIMNamespaceName::CIMNamespaceName(const char* name) : fName(checkedNamespace(name)) {}

CIMNamespaceName& CIMNamespaceName::operator=(const String& name)
{
    fName = checkedNamespace(name);
    return *this;
}

Boolean CIMNamespaceName::equal(const CIMNamespaceName& name) const
{
    return String::equalNoCase(fName, name.fName);
}

Boolean CIMNamespaceName::legal(const String& name)
{
    const Uint32 skipped = leadingSlash(name);
    return isLegalNamespace(name.getChar16Data() + skipped, name.size() - skipped);
}

Boolean operator==(const CIMNamespaceName& name1, const CIMNamespaceName& name2)
{
    return name1.equal(name2);
}

Boolean operator!=(const CIMNamespaceName& name1, const CIMNamespaceName& name2)
{
    return !name1.equal(name2);
}

} // namespace Pegasus
