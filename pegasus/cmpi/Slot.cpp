#include "pegasus/cmpi/Slot.h"

#include "pegasus/cmpi/StringObject.h"
#include "pegasus/cmpi/Text.h"

#include <Pegasus/Common/Exception.h>

#include <exception>
#include <new>

namespace Pegasus::cmpi {

CMPIStatus makeStatus(CMPIrc code, const std::string& text) noexcept
{
    try {
        if (!text.empty()) {
            return {code, Frame::current().make<StringObject>(text)};
        }
    } catch (const std::bad_alloc&) {
        // the code alone has to do
    }
    return {code, nullptr};
}

CMPIStatus currentFailure() noexcept
{
    try {
        throw;
    } catch (const SlotError& error) {
        return makeStatus(error.code, error.text);
    } catch (const CIMException& error) {
        return makeStatus(static_cast<CMPIrc>(error.getCode()), utf8(error.getMessage()));
    } catch (const Exception& error) {
        return makeStatus(CMPI_RC_ERROR_SYSTEM, utf8(error.getMessage()));
    } catch (const std::exception& error) {
        return makeStatus(CMPI_RC_ERROR_SYSTEM, error.what());
    } catch (...) {
        return makeStatus(CMPI_RC_ERROR_SYSTEM, "unknown error");
    }
}

const char* requireText(const char* text)
{
    if (text == nullptr) {
        throw SlotError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
    }
    return text;
}

} // namespace Pegasus::cmpi
