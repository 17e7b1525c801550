// SPDX-License-Identifier: MIT
// A vendor's library that lacks a symbol; one build of it also needs a library that is not there.
extern "C" void AcmeMissingFunction();

extern "C" void AcmeEntry()
{
    AcmeMissingFunction();
}
