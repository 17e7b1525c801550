// SPDX-License-Identifier: MIT
#include "fuzz/cmpi_broker/CarelessProvider.h"

#include "fuzz/cmpi_broker/Require.h"

#include <algorithm>
#include <cstddef>
#include <iterator>

namespace fuzz {

namespace {

constexpr std::size_t kMaxCalls = 400;

} // namespace

void CarelessProvider::run()
{
    using Step = void (CarelessProvider::*)();
    static constexpr Step kSteps[] = {
        &CarelessProvider::makeSimple,  &CarelessProvider::makePath,     &CarelessProvider::makeInstance,
        &CarelessProvider::makeDate,    &CarelessProvider::makeArray,    &CarelessProvider::makeError,
        &CarelessProvider::usePath,     &CarelessProvider::setKey,       &CarelessProvider::readKey,
        &CarelessProvider::setInstance, &CarelessProvider::readInstance, &CarelessProvider::useArray,
        &CarelessProvider::setElement,  &CarelessProvider::useArgs,      &CarelessProvider::useDate,
        &CarelessProvider::useError,    &CarelessProvider::useContext,   &CarelessProvider::useEnumeration,
        &CarelessProvider::upcall,      &CarelessProvider::change,       &CarelessProvider::deliver,
        &CarelessProvider::ask,         &CarelessProvider::message,      &CarelessProvider::release,
        &CarelessProvider::clone,       &CarelessProvider::unsupported};
    for (std::size_t i = 0; i < kMaxCalls && !fIn.isAtEnd(); ++i) {
        (this->*kSteps[fIn.byte() % std::size(kSteps)])();
    }
    for (const auto& free : fClones) {
        free.second();
    }
}

template <typename Face> void CarelessProvider::releaseIn(Places<Face>& places)
{
    Face* object = places.get(fIn);
    if (object == nullptr) {
        return;
    }
    const bool hasHandle = object->hdl != nullptr;
    const CMPIrc code = object->ft->release(object).rc;
    require(hasHandle || code == CMPI_RC_ERR_INVALID_HANDLE);
    if (code == CMPI_RC_OK) { // strict providers may be refused: the object stays
        places.forget(object);
        fClones.erase(
            std::remove_if(fClones.begin(), fClones.end(), [&](const auto& each) { return each.first == object; }),
            fClones.end());
    }
}

void CarelessProvider::release()
{
    switch (fIn.byte() % 9) {
    case 0:
        releaseIn(fStrings);
        break;
    case 1:
        releaseIn(fPaths);
        break;
    case 2:
        releaseIn(fInstances);
        break;
    case 3:
        releaseIn(fArrays);
        break;
    case 4:
        releaseIn(fDates);
        break;
    case 5:
        releaseIn(fArgs);
        break;
    case 6:
        releaseIn(fErrors);
        break;
    case 7:
        releaseIn(fEnumerations);
        break;
    default: // arguments of the call: nothing happens
        fPath->ft->release(const_cast<CMPIObjectPath*>(fPath));
        fOut->ft->release(fOut);
        break;
    }
}

template <typename Face> void CarelessProvider::cloneIn(Places<Face>& places)
{
    const Face* object = places.get(fIn);
    if (object == nullptr) {
        return;
    }
    CMPIStatus* rc = status();
    if (Face* copy = object->ft->clone(object, rc)) {
        fClones.emplace_back(copy, [copy] { copy->ft->release(copy); });
        places.put(fIn, copy);
    }
}

void CarelessProvider::clone()
{
    switch (fIn.byte() % 7) {
    case 0:
        cloneIn(fStrings);
        break;
    case 1:
        cloneIn(fPaths);
        break;
    case 2:
        cloneIn(fInstances);
        break;
    case 3:
        cloneIn(fArrays);
        break;
    case 4:
        cloneIn(fDates);
        break;
    case 5:
        cloneIn(fArgs);
        break;
    default:
        cloneIn(fErrors);
        break;
    }
}

} // namespace fuzz
