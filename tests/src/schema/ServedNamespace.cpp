// SPDX-License-Identifier: MIT
#include "tests/src/schema/ServedNamespace.h"

#include "src/common/Constants.h"

#include <boost/make_shared.hpp>

namespace NKOLVRX20 {

TServedNamespace::TServedNamespace() : fPeer(fModel.handler()), fNamespace(fRig.MakeNamespaceWithConsumer())
{
    using namespace Pegasus;
    for (const char* name : {"Key", "Association", "Abstract", "In", "Out"}) {
        fModel.addQualifier(kNsp, CIMQualifierDecl(CIMName(name), CIMValue(false), CIMScope::ANY));
    }
    fModel.addQualifier(kNsp, CIMQualifierDecl(CIMName("Override"), CIMValue(CIMTYPE_STRING, false),
                                               CIMScope::PROPERTY + CIMScope::METHOD, CIMFlavor::RESTRICTED));
    fNamespace->Init();
    fNamespace->connect("127.0.0.1", fPeer.port(), "", "");
    fRig.fLog.Take();
}

boost::shared_ptr<TPEGASUSClass> TServedNamespace::Class(const std::string& name, const std::string& timeout)
{
    return boost::dynamic_pointer_cast<TPEGASUSClass>(fNamespace->GetClass(name, {{kTimeoutKey, timeout}}));
}

boost::shared_ptr<TPEGASUSProvider> TServedNamespace::MakeProvider(const std::string& cimNamespace) const
{
    const auto provider = boost::make_shared<TPEGASUSProvider>();
    provider->SetNameSpaceName(cimNamespace);
    provider->initPegasusClient();
    provider->connectPegasusClient("127.0.0.1", fPeer.port(), "", "");
    return provider;
}

std::vector<std::string> TServedNamespace::TakeRequests()
{
    std::vector<std::string> names;
    const auto requests = fPeer.requests();
    for (; fSeen < requests.size(); ++fSeen) {
        names.push_back(RequestName(requests[fSeen]));
    }
    return names;
}

Pegasus::CIMQualifier TrueQualifier(const char* name)
{
    return Pegasus::CIMQualifier(Pegasus::CIMName(name), Pegasus::CIMValue(true));
}

Pegasus::CIMQualifier TextQualifier(const char* name, const char* text)
{
    return Pegasus::CIMQualifier(Pegasus::CIMName(name), Pegasus::CIMValue(Pegasus::String(text)));
}

Pegasus::CIMProperty Property(const char* name, const Pegasus::CIMValue& value, const char* qualifier)
{
    Pegasus::CIMProperty property{Pegasus::CIMName(name), value};
    if (qualifier) {
        property.addQualifier(TrueQualifier(qualifier));
    }
    return property;
}

} // namespace NKOLVRX20
