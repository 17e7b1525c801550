// SPDX-License-Identifier: MIT
/*
  What depends on the platform, which is Linux here whatever CMPI_PLATFORM_... says, and the version of the interface
  that a provider is compiled for: its tables carry CMPI_VERSION, and a broker calls no slot that is newer.
 */
#pragma once

#ifndef CMPI_VERSION
#define CMPI_VERSION 200
#endif

#define CMPI_EXPORT __attribute__((visibility("default")))
#define CMPI_IMPORT
#ifdef __cplusplus
#define CMPI_EXTERN_C extern "C"
#else
#define CMPI_EXTERN_C
#endif
