// SPDX-License-Identifier: MIT
/* Everything that the source of a CMPI provider needs. */
#pragma once

#include "broker.h"
#include "objects.h"
#include "provider.h"
#include "types.h"
