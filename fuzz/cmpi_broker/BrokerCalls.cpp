// SPDX-License-Identifier: MIT
// Operations of the server that the provider calls back, what it delivers, and the broker's other services.
#include "fuzz/cmpi_broker/CarelessProvider.h"
#include "fuzz/cmpi_broker/Require.h"

namespace fuzz {

void CarelessProvider::upcall()
{
    CMPIStatus* rc = status();
    const CMPIBrokerFT* bft = fMb->bft;
    switch (fIn.byte() % 5) {
    case 0:
        fEnumerations.put(fIn, made(bft->enumerateInstances(fMb, fContext, path(), list(), rc), rc));
        break;
    case 1:
        fEnumerations.put(fIn, made(bft->enumerateInstanceNames(fMb, fContext, path(), rc), rc));
        break;
    case 2:
        fInstances.put(fIn, made(bft->getInstance(fMb, fContext, path(), list(), rc), rc));
        break;
    case 3:
        keep(bft->getProperty(fMb, fContext, path(), fIn.text(), rc));
        break;
    default:
        keep(bft->invokeMethod(fMb, fContext, path(), fIn.text(), args(), fArgs.get(fIn), rc));
        break;
    }
}

void CarelessProvider::change()
{
    CMPIStatus* rc = status();
    const CMPIBrokerFT* bft = fMb->bft;
    const Passed passed = value();
    const CMPIInstance* instance = fInstances.get(fIn);
    switch (fIn.byte() % 5) {
    case 0:
        fPaths.put(fIn, bft->createInstance(fMb, fContext, path(), instance, rc));
        break;
    case 1:
        bft->modifyInstance(fMb, fContext, path(), instance, list());
        break;
    case 2:
        bft->deleteInstance(fMb, fContext, path());
        break;
    case 3:
        bft->setProperty(fMb, fContext, path(), fIn.text(), passed.value, passed.type);
        break;
    default:
        bft->deliverIndication(fMb, fContext, fIn.text(), instance);
        break;
    }
}

void CarelessProvider::deliver()
{
    const Passed passed = value();
    switch (fIn.byte() % 4) {
    case 0:
        fResult->ft->returnObjectPath(fResult, path());
        break;
    case 1:
        fResult->ft->returnData(fResult, passed.value, passed.type);
        break;
    default:
        fResult->ft->returnInstance(fResult, fInstances.get(fIn));
        break;
    }
}

const void* CarelessProvider::anyObject()
{
    switch (fIn.byte() % 7) {
    case 0:
        return fStrings.get(fIn);
    case 1:
        return fPaths.get(fIn);
    case 2:
        return fInstances.get(fIn);
    case 3:
        return fArrays.get(fIn);
    case 4:
        return fDates.get(fIn);
    case 5:
        return fErrors.get(fIn);
    default:
        return fContext;
    }
}

void CarelessProvider::ask()
{
    CMPIStatus* rc = status();
    switch (fIn.byte() % 4) {
    case 0:
        fLength += fMb->eft->classPathIsA(fMb, path(), fIn.text(), rc);
        break;
    case 1:
        keep(fMb->eft->toString(fMb, anyObject(), rc));
        break;
    case 2:
        keep(fMb->eft->getType(fMb, anyObject(), rc));
        break;
    default:
        fLength += fMb->eft->isOfType(fMb, anyObject(), fIn.text(), rc);
        break;
    }
    answered(rc);
}

void CarelessProvider::message()
{
    CMPIStatus* rc = status();
    const char* id = fIn.text();
    const char* text = fIn.text();
    const CMPIString* string = fStrings.get(fIn);
    switch (fIn.byte() % 4) {
    case 0:
        fMb->eft->logMessage(fMb, static_cast<CMPISeverity>(fIn.byte()), id, text, string);
        break;
    case 1:
        fMb->eft->trace(fMb, CMPI_LEV_INFO, id, text, string);
        break;
    case 2:
        keep(fMb->eft->getMessage(fMb, id, text, rc, 0));
        break;
    default:
        keep(fMb->eft->getMessage(fMb, id, text, rc, 3, CMPI_sint16, fIn.byte(), CMPI_chars, fIn.text(), CMPI_string,
                                  string));
        break;
    }
}

void CarelessProvider::unsupported()
{
    CMPIStatus* rc = status();
    CMPIArray* projection = nullptr;
    const char* query = fIn.text();
    const char* language = fIn.text();
    require(fMb->eft->newSelectExp(fMb, query, language, &projection, rc) == nullptr);
    require(fMb->bft->execQuery(fMb, fContext, path(), query, language, rc) == nullptr);
    require(fMb->bft->associators(fMb, fContext, path(), query, language, nullptr, nullptr, list(), rc) == nullptr);
    answered(rc);
}

} // namespace fuzz
