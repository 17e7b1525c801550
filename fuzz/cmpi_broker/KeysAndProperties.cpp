// SPDX-License-Identifier: MIT
// Named and numbered values: keys, properties, elements of arrays, arguments of methods.
#include "fuzz/cmpi_broker/CarelessProvider.h"

namespace fuzz {

void CarelessProvider::setKey()
{
    const Passed passed = value();
    if (CMPIObjectPath* p = fPaths.get(fIn)) {
        p->ft->addKey(p, fIn.text(), passed.value, passed.type);
    }
}

void CarelessProvider::readKey()
{
    const CMPIObjectPath* p = path();
    if (p == nullptr) {
        return;
    }
    CMPIStatus* rc = status();
    CMPIString* name = nullptr;
    if (fIn.byte() % 2 == 0) {
        keep(p->ft->getKey(p, fIn.text(), rc));
    } else {
        keep(p->ft->getKeyAt(p, fIn.byte() % 8, fIn.byte() % 2 == 0 ? nullptr : &name, rc));
    }
    keep(name);
    fLength += p->ft->getKeyCount(p, rc);
    answered(rc);
}

void CarelessProvider::setInstance()
{
    const Passed passed = value();
    const CMPIInstance* i = fInstances.get(fIn);
    if (i == nullptr) {
        return;
    }
    switch (fIn.byte() % 8) {
    case 0:
        i->ft->setPropertyWithOrigin(i, fIn.text(), passed.value, passed.type, fIn.text());
        break;
    case 1:
        i->ft->setObjectPath(i, path());
        break;
    case 2:
        i->ft->setPropertyFilter(i, list(), nullptr);
        break;
    default:
        i->ft->setProperty(i, fIn.text(), passed.value, passed.type);
        break;
    }
}

void CarelessProvider::readInstance()
{
    const CMPIInstance* i = fInstances.get(fIn);
    if (i == nullptr) {
        return;
    }
    CMPIStatus* rc = status();
    CMPIString* name = nullptr;
    switch (fIn.byte() % 3) {
    case 0:
        keep(i->ft->getProperty(i, fIn.text(), rc));
        break;
    case 1:
        keep(i->ft->getPropertyAt(i, fIn.byte() % 20, fIn.byte() % 2 == 0 ? nullptr : &name, rc));
        break;
    default:
        fPaths.put(fIn, i->ft->getObjectPath(i, rc));
        break;
    }
    keep(name);
    fLength += i->ft->getPropertyCount(i, rc);
    answered(rc);
}

void CarelessProvider::useArray()
{
    if (const CMPIArray* a = fArrays.get(fIn)) {
        CMPIStatus* rc = status();
        fLength += a->ft->getSize(a, rc) + a->ft->getSimpleType(a, rc);
        keep(a->ft->getElementAt(a, fIn.byte() % 9, rc));
        answered(rc);
    }
}

void CarelessProvider::setElement()
{
    const Passed passed = value();
    if (const CMPIArray* a = fArrays.get(fIn)) {
        a->ft->setElementAt(a, fIn.byte() % 9, passed.value, passed.type);
    }
}

void CarelessProvider::useArgs()
{
    const CMPIArgs* a = args();
    if (a == nullptr) {
        return;
    }
    CMPIStatus* rc = status();
    CMPIString* name = nullptr;
    const Passed passed = value();
    switch (fIn.byte() % 4) {
    case 0:
        keep(a->ft->getArg(a, fIn.text(), rc));
        break;
    case 1:
        keep(a->ft->getArgAt(a, fIn.byte() % 8, &name, rc));
        break;
    case 2:
        fOut->ft->addArg(fOut, fIn.text(), passed.value, passed.type);
        break;
    default:
        a->ft->addArg(a, fIn.text(), passed.value, passed.type);
        break;
    }
    keep(name);
    fLength += a->ft->getArgCount(a, rc);
    answered(rc);
}

} // namespace fuzz
