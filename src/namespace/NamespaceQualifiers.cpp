// The qualifier declarations of this namespace, and the way to the host's own.
#include "src/namespace/DefinitionSlot.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/schema/TPEGASUSQualifierDecl.h"
#include "src/schema/VisitInOrder.h"

#include <boost/make_shared.hpp>

namespace NKOLVRX20 {

boost::shared_ptr<ICIMQualifierDecl> TPEGASUSNamespace::AllocateQualifierDecl(const std::string& name,
                                                                              TCIMValue defaultValue,
                                                                              ICIMQualifierDecl::EScope scope,
                                                                              ICIMQualifierDecl::EFlavor flavor,
                                                                              TCIMContext)
{
    return boost::make_shared<TPEGASUSQualifierDecl>(shared_from_this(), name, defaultValue, scope, flavor);
}

void TPEGASUSNamespace::AddQualifierDecl(boost::shared_ptr<TPEGASUSQualifierDecl> declaration)
{
    DefinitionSlot(fQualifierDecls, declaration->GetName({}), fAllowRedefinition, "TPEGASUSNamespace: qualifier ") =
        declaration;
}

boost::shared_ptr<TPEGASUSQualifierDecl> TPEGASUSNamespace::FindQualifierDecl(const std::string& name) const
{
    const auto entry = fQualifierDecls.find(NormalizeName(name));
    return entry == fQualifierDecls.end() ? nullptr : entry->second;
}

boost::shared_ptr<ICIMQualifierDecl> TPEGASUSNamespace::GetQualifierDecl(const std::string& name, TCIMContext context)
{
    return GetUpcallNamespace()->GetQualifierDecl(name, context);
}

void TPEGASUSNamespace::EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext)
{
    VisitInOrder(fQualifierDecls, visitor);
}

} // namespace NKOLVRX20
