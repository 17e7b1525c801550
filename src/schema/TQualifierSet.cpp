#include "src/schema/TQualifierSet.h"

#include "src/namespace/TPEGASUSNamespace.h"
#include "src/schema/TPEGASUSQualifier.h"
#include "src/schema/VisitInOrder.h"

#include <host/TVRXException.h>

namespace NKOLVRX20 {

void TQualifierSet::Add(const boost::shared_ptr<ICIMQualifier>& qualifier)
{
    const auto own = boost::dynamic_pointer_cast<TPEGASUSQualifier>(qualifier);
    if (!own) {
        throw TVRXException(TVRXStatusCode::kTypeMismatch);
    }
    fQualifiers[TPEGASUSNamespace::NormalizeName(own->GetName({}))] = own;
}

boost::shared_ptr<ICIMQualifier> TQualifierSet::Find(const std::string& name) const
{
    const auto entry = fQualifiers.find(TPEGASUSNamespace::NormalizeName(name));
    return entry == fQualifiers.end() ? nullptr : entry->second;
}

void TQualifierSet::Enumerate(const TQualifierVisitor& visitor) const
{
    VisitInOrder(fQualifiers, visitor);
}

} // namespace NKOLVRX20
