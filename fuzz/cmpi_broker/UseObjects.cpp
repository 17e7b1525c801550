// SPDX-License-Identifier: MIT
// Object paths without their keys, dates, errors, the context and enumerations.
#include "fuzz/cmpi_broker/CarelessProvider.h"

namespace fuzz {

void CarelessProvider::usePath()
{
    CMPIObjectPath* p = fPaths.get(fIn);
    if (p == nullptr) {
        return;
    }
    CMPIStatus* rc = status();
    switch (fIn.byte() % 9) {
    case 0:
        p->ft->setNameSpace(p, fIn.text());
        break;
    case 1:
        p->ft->setHostname(p, fIn.text());
        break;
    case 2:
        p->ft->setClassName(p, fIn.text());
        break;
    case 3:
        keep(p->ft->getNameSpace(p, rc));
        break;
    case 4:
        keep(p->ft->getHostname(p, rc));
        break;
    case 5:
        keep(p->ft->getClassName(p, rc));
        break;
    case 6:
        keep(p->ft->toString(p, rc));
        break;
    case 7:
        p->ft->setNameSpaceFromObjectPath(p, path());
        break;
    default:
        p->ft->setHostAndNameSpaceFromObjectPath(p, path());
        break;
    }
}

void CarelessProvider::useDate()
{
    if (const CMPIDateTime* d = fDates.get(fIn)) {
        CMPIStatus* rc = status();
        fLength += d->ft->getBinaryFormat(d, rc) + d->ft->isInterval(d, rc);
        keep(d->ft->getStringFormat(d, rc));
        answered(rc);
    }
}

void CarelessProvider::useError()
{
    const CMPIError* e = fErrors.get(fIn);
    if (e == nullptr) {
        return;
    }
    CMPIStatus* rc = status();
    switch (fIn.byte() % 10) {
    case 0:
        keep(e->ft->getOtherErrorType(e, rc));
        break;
    case 1:
        keep(e->ft->getMessage(e, rc));
        break;
    case 2:
        keep(e->ft->getCIMStatusCodeDescription(e, rc));
        break;
    case 3:
        fArrays.put(fIn, e->ft->getRecommendedActions(e, rc));
        break;
    case 4:
        fArrays.put(fIn, e->ft->getMessageArguments(e, rc));
        break;
    case 5:
        e->ft->setRecommendedActions(e, fArrays.get(fIn));
        break;
    case 6:
        e->ft->setMessageArguments(e, fArrays.get(fIn));
        break;
    case 7:
        e->ft->setOtherErrorType(e, fIn.text());
        break;
    case 8:
        e->ft->setErrorSource(e, fIn.text());
        break;
    default:
        fResult->ft->returnError(fResult, e);
        break;
    }
}

void CarelessProvider::useContext()
{
    CMPIStatus* rc = status();
    CMPIString* name = nullptr;
    const Passed passed = value();
    switch (fIn.byte() % 3) {
    case 0:
        keep(fContext->ft->getEntry(fContext, fIn.text(), rc));
        break;
    case 1:
        keep(fContext->ft->getEntryAt(fContext, fIn.byte() % 8, &name, rc));
        break;
    default:
        fContext->ft->addEntry(fContext, fIn.text(), passed.value, passed.type);
        break;
    }
    keep(name);
    fLength += fContext->ft->getEntryCount(fContext, rc);
    answered(rc);
}

void CarelessProvider::useEnumeration()
{
    if (const CMPIEnumeration* e = fEnumerations.get(fIn)) {
        CMPIStatus* rc = status();
        switch (fIn.byte() % 3) {
        case 0:
            fLength += e->ft->hasNext(e, rc);
            break;
        case 1:
            keep(e->ft->getNext(e, rc));
            break;
        default:
            fArrays.put(fIn, e->ft->toArray(e, rc));
            break;
        }
    }
}

} // namespace fuzz
