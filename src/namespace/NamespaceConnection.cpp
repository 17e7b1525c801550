#include "src/namespace/TPEGASUSNamespace.h"

namespace NKOLVRX20 {

void TPEGASUSNamespace::Init()
{
    fConnection.Init();
}

void TPEGASUSNamespace::connect(const std::string& host, unsigned short port, const std::string& user,
                                const std::string& password)
{
    fConnection.Connect(host, port, user, password);
}

} // namespace NKOLVRX20
