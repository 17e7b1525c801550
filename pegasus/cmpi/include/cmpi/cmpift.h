// SPDX-License-Identifier: MIT
/* Function tables of broker, objects and providers, under the name that providers' sources include. */
#pragma once

#include "broker.h"
#include "cmpidt.h"
#include "objects.h"
#include "provider.h"
