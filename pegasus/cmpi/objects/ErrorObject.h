// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/ArrayObject.h"

#include <array>
#include <optional>
#include <string>

namespace Pegasus::cmpi {

// A CMPIError: what a provider says of a failure beyond its status.
class ErrorObject final : public Owned, public CMPIError
{
  public:
    enum Text
    {
        kOwningEntity,
        kMessageId,
        kMessage,
        kOtherErrorType,
        kProbableCauseDescription,
        kErrorSource,
        kOtherErrorSourceFormat,
        kStatusCodeDescription,
        kTextCount
    };
    enum List
    {
        kRecommendedActions,
        kMessageArguments,
        kListCount
    };

    // The texts may be null.
    ErrorObject(Broker& owner, const char* owningEntity, const char* messageId, const char* message,
                CMPIErrorSeverity severity, CMPIErrorProbableCause cause, CMPIrc statusCode);
    ErrorObject(const ErrorObject& other);

    Broker& broker;
    CMPIErrorType type = UnknownErrorType;
    CMPIErrorSrcFormat sourceFormat{};
    const CMPIErrorSeverity severity;
    const CMPIErrorProbableCause cause;
    const CMPIrc code;
    std::array<std::optional<std::string>, kTextCount> texts;
    std::array<std::vector<CIMValue>, kListCount> lists;
    Lifetime lifetime = Lifetime::kFrame;
};

extern const CMPIErrorFT kErrorTable;

} // namespace Pegasus::cmpi
