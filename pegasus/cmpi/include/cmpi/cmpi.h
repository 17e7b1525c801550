// SPDX-License-Identifier: MIT
/* Everything that the source of a CMPI provider needs but the macros of cmpimacs.h. */
#pragma once

#include "cmpidt.h"
#include "cmpift.h"
#include "cmpios.h"
