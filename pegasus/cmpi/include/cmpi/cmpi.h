/* Everything that the source of a CMPI provider needs. */
#ifndef CMPI_CMPI_H
#define CMPI_CMPI_H

#include "broker.h"
#include "objects.h"
#include "provider.h"
#include "types.h"

#endif
