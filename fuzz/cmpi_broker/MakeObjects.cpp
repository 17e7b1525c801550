// SPDX-License-Identifier: MIT
// The broker's factories.
#include "fuzz/cmpi_broker/CarelessProvider.h"

namespace fuzz {

void CarelessProvider::makeSimple()
{
    CMPIStatus* rc = status();
    if (fIn.byte() % 2 == 0) {
        fStrings.put(fIn, made(fMb->eft->newString(fMb, fIn.text(), rc), rc));
    } else {
        fArgs.put(fIn, made(fMb->eft->newArgs(fMb, rc), rc));
    }
}

void CarelessProvider::makePath()
{
    CMPIStatus* rc = status();
    const char* nameSpace = fIn.byte() % 2 == 0 ? kNamespace : fIn.text();
    fPaths.put(fIn, made(fMb->eft->newObjectPath(fMb, nameSpace, fIn.text(), rc), rc));
}

void CarelessProvider::makeInstance()
{
    CMPIStatus* rc = status();
    fInstances.put(fIn, made(fMb->eft->newInstance(fMb, path(), rc), rc));
}

void CarelessProvider::makeDate()
{
    CMPIStatus* rc = status();
    switch (fIn.byte() % 3) {
    case 0:
        fDates.put(fIn, made(fMb->eft->newDateTime(fMb, rc), rc));
        break;
    case 1:
        fDates.put(fIn, made(fMb->eft->newDateTimeFromChars(fMb, fIn.text(), rc), rc));
        break;
    default: {
        CMPIUint64 time = 0;
        for (int i = 0; i < 8; ++i) {
            time = time << 8 | fIn.byte();
        }
        fDates.put(fIn, made(fMb->eft->newDateTimeFromBinary(fMb, time, fIn.byte() % 2, rc), rc));
    }
    }
}

void CarelessProvider::makeArray()
{
    CMPIStatus* rc = status();
    const CMPIType type = value().type;
    const CMPICount size = fIn.byte() == 0xFF ? 0xFFFFFFFFU : fIn.byte() % 8;
    fArrays.put(fIn, made(fMb->eft->newArray(fMb, size, type, rc), rc));
}

void CarelessProvider::makeError()
{
    CMPIStatus* rc = status();
    const char* owner = fIn.text();
    const char* id = fIn.text();
    const char* text = fIn.text();
    const auto code = static_cast<CMPIrc>(fIn.byte());
    fErrors.put(fIn,
                made(fMb->eft->newCMPIError(fMb, owner, id, text, ErrorSevLow, ErrorProbCauseOther, code, rc), rc));
}

} // namespace fuzz
