// Texts and numbers that several concerns of the namespace share.
#pragma once

#include "src/common/ClientConnection.h"

namespace NKOLVRX20 {

// The port that the server gets when it is free.
inline constexpr unsigned short kPreferredPort = 5988;

inline constexpr TConnectionTexts kNamespaceConnectionTexts = {
    "TPEGASUSNamespace:Pegasus Client Creation Fail: ",
    "TPEGASUSNamespace::connect enter",
    "TPEGASUSNamespace::connect succeeded \n",
    "TPEGASUSNamespace::connect failed: ",
};

inline constexpr char kShutdownStepFailedText[] = "TPEGASUSNamespace::~TPEGASUSNamespace failed at ";

// A context value that should be a sint8, or a string: one message for both.
inline constexpr char kWrongContextTypeText[] =
    "Invalid context pluginType datatype provided to TPluginManagerNamespace::EnumerateProviders(), must be of type "
    "kSint8.";

} // namespace NKOLVRX20
