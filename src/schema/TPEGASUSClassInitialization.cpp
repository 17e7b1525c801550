// SPDX-License-Identifier: MIT
// How a new class gets its settings and its declarations from the server.
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/schema/ClassMirror.h"
#include "src/schema/TPEGASUSClass.h"

#include <algorithm>
#include <cstdlib>
#include <limits>

namespace NKOLVRX20 {

namespace {

constexpr unsigned long kMsPerSecond = 1000;
constexpr unsigned long kLongestSeconds = std::numeric_limits<unsigned int>::max() / kMsPerSecond;

// Whatever the host's locale counts as a digit.
bool IsDigit(char character)
{
    return character >= '0' && character <= '9';
}

} // namespace

unsigned int MillisecondsFromText(const std::string& seconds)
{
    const auto number = static_cast<unsigned long>(std::strtol(seconds.c_str(), nullptr, kDecimal));
    return static_cast<unsigned int>(number * kMsPerSecond);
}

// A number of digits alone that is too long for strtol becomes its largest result, which is too large here.
bool IsPlainTimeout(const std::string& seconds)
{
    return !seconds.empty() && std::all_of(seconds.begin(), seconds.end(), IsDigit) &&
           static_cast<unsigned long>(std::strtol(seconds.c_str(), nullptr, kDecimal)) <= kLongestSeconds;
}

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
