// How a new class gets its settings and its declarations from the server.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/common/Timeouts.h"
#include "src/schema/ClassMirror.h"
#include "src/schema/TPEGASUSClass.h"

namespace NKOLVRX20 {

void TPEGASUSClass::Initialize(const std::string& cimNamespace, const std::string& timeout,
                               const boost::shared_ptr<TPEGASUSClass>& superClass)
{
    fTimeout = timeout;
    fDefaultTimeoutMs = MillisecondsFromText(timeout);
    fPegasusNspText = cimNamespace;
    fSuperClass = superClass;
    try {
        fPegasusNsp = Pegasus::CIMNamespaceName(cimNamespace.c_str());
        if (fName == kRootClassName) {
            return;
        }
        Pegasus::CIMClient& client = fNamespace.ConnectedClient();
        client.setTimeout(kGetClassTimeoutMs); // the class's own timeout is for its instances
        TClassMirror(*this).Mirror(client.getClass(fPegasusNsp, Pegasus::CIMName(fName.c_str()), false, true, false));
    } catch (const Pegasus::Exception& exception) {
        LogFailure("TPEGASUSClass::Initialize - Unable to retrieve class: ", fName,
                   "\tdetail: ", ToStdString(exception.getMessage()));
        throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
    }
    // Last, so that only a class that was read joins its superclass's children.
    if (superClass) {
        superClass->AddChildClass(shared_from_this());
    }
}

} // namespace NKOLVRX20
