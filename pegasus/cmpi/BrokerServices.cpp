#include "pegasus/cmpi/BrokerServices.h"

#include <Pegasus/Common/Exception.h>

namespace Pegasus::cmpi {

CIMObjectPath BrokerServices::createInstance(const CIMNamespaceName&, const CIMInstance&)
{
    throw CIMException(CIM_ERR_NOT_SUPPORTED, String("CreateInstance"));
}

void BrokerServices::modifyInstance(const CIMNamespaceName&, const CIMInstance&, const CIMPropertyList&)
{
    throw CIMException(CIM_ERR_NOT_SUPPORTED, String("ModifyInstance"));
}

void BrokerServices::deleteInstance(const CIMNamespaceName&, const CIMObjectPath&)
{
    throw CIMException(CIM_ERR_NOT_SUPPORTED, String("DeleteInstance"));
}

} // namespace Pegasus::cmpi
