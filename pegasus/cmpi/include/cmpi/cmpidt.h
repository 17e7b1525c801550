// SPDX-License-Identifier: MIT
/* Data types, under the name that providers' sources include. */
#pragma once

#include "cmpipl.h"
#include "types.h"
