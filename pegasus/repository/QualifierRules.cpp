// SPDX-License-Identifier: MIT
#include "pegasus/repository/QualifierRules.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"

namespace Pegasus::repository {

namespace {

// A use may only take away what its declaration allows (overriding, passing on). Translatable is the exception, which
// describes the text.
CIMFlavor effectiveFlavor(const CIMFlavor& use, const CIMFlavor& declared)
{
    const bool isOverridable = use.hasFlavor(CIMFlavor::OVERRIDABLE);
    const bool isHandedDown = use.hasFlavor(CIMFlavor::TOSUBCLASS);
    CIMFlavor flavor = declared;
    if (!isOverridable && !isHandedDown) {
        return flavor;
    }
    if (!isOverridable) {
        flavor.removeFlavor(CIMFlavor::OVERRIDABLE);
        flavor.addFlavor(CIMFlavor::DISABLEOVERRIDE);
    }
    if (!isHandedDown) {
        flavor.removeFlavor(CIMFlavor::TOSUBCLASS);
        flavor.addFlavor(CIMFlavor::RESTRICTED);
    }
    if (use.hasFlavor(CIMFlavor::TRANSLATABLE)) {
        flavor.addFlavor(CIMFlavor::TRANSLATABLE);
    }
    return flavor;
}

// An association or indication is a class too: a declaration for classes admits it.
bool admits(const CIMScope& declared, const CIMScope& scope)
{
    const bool isKindOfClass = scope.equal(CIMScope::ASSOCIATION) || scope.equal(CIMScope::INDICATION);
    return declared.hasScope(scope) || (isKindOfClass && declared.hasScope(CIMScope::CLASS));
}

} // namespace

CIMQualifier checkedQualifier(const CIMConstQualifier& use, const CIMScope& scope, const QualifierLookup& lookup)
{
    CIMQualifierDecl declaration;
    if (!lookup(use.getName(), declaration)) {
        fail(CIM_ERR_FAILED, "undeclared qualifier: " + base::utf8(use.getName()));
    }
    if (use.getType() != declaration.getType() || use.isArray() != declaration.isArray()) {
        fail(CIM_ERR_FAILED, "bad qualifier type: " + base::utf8(use.getName()));
    }
    if (!admits(declaration.getScope(), scope)) {
        fail(CIM_ERR_FAILED, "qualifier invalid in this scope: " + base::utf8(use.getName()) +
                                 " scope=" + base::utf8(scope.toString()));
    }
    return CIMQualifier(use.getName(), use.getValue(), effectiveFlavor(use.getFlavor(), declaration.getFlavor()));
}

void checkOverride(const CIMConstQualifier& use, const CIMConstQualifier& inherited)
{
    const CIMFlavor& flavor = inherited.getFlavor();
    if (flavor.hasFlavor(CIMFlavor::TOSUBCLASS) && !flavor.hasFlavor(CIMFlavor::OVERRIDABLE) &&
        use.getValue() != inherited.getValue())
    {
        fail(CIM_ERR_FAILED, "qualifier cannot be overridden: " + base::utf8(use.getName()));
    }
}

} // namespace Pegasus::repository
