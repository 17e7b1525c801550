// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/TableFunction.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/StringObject.h"

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
        // the status goes out with its code alone
    }
    return {code, nullptr};
}

CMPIStatus currentFailure() noexcept
{
    try {
        throw;
    } catch (const CmpiError& error) {
        return makeStatus(error.code, error.text);
    } catch (const CIMException& error) {
        return makeStatus(static_cast<CMPIrc>(error.getCode()), base::utf8(error.getMessage()));
    } catch (const Exception& error) {
        return makeStatus(CMPI_RC_ERROR_SYSTEM, base::utf8(error.getMessage()));
    } catch (const std::exception& error) {
        return makeStatus(CMPI_RC_ERROR_SYSTEM, error.what());
    } catch (...) {
        return makeStatus(CMPI_RC_ERROR_SYSTEM, "unknown error");
    }
}

const char* requireText(const char* text)
{
    if (text == nullptr) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
    }
    return text;
}

CIMName requireName(const char* text)
{
    try {
        return CIMName(requireText(text));
    } catch (const Exception& error) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, base::utf8(error.getMessage())};
    }
}

} // namespace Pegasus::cmpi
