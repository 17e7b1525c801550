// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/Frame.h"

namespace Pegasus::cmpi {
namespace {

thread_local Frame* tCurrent = nullptr;

} // namespace

void Owned::unlink()
{
    if (fNext == nullptr) {
        return;
    }
    fPrevious->fNext = fNext;
    fNext->fPrevious = fPrevious;
    fPrevious = fNext = nullptr;
}

Frame::Frame() : Frame(tCurrent == nullptr ? nullptr : tCurrent->fOrigin) {}

Frame::Frame(std::shared_ptr<const CallOrigin> origin) : fOuter(tCurrent), fOrigin(std::move(origin))
{
    fObjects.fPrevious = fObjects.fNext = &fObjects;
    tCurrent = this;
}

Frame::~Frame()
{
    // A provider may end its frames in any order; the end of an outer one has drained and closed this one already.
    const bool wasOpen = isOpen(this);
    for (; wasOpen && tCurrent != this; tCurrent = tCurrent->fOuter) {
        tCurrent->drain();
    }
    drain();
    if (wasOpen) {
        tCurrent = fOuter;
    }
}

Frame& Frame::current()
{
    if (tCurrent == nullptr) {
        static thread_local Frame fgRoot;
        tCurrent = &fgRoot;
    }
    return *tCurrent;
}

const CallOrigin& Frame::origin() const
{
    static const CallOrigin kNone;
    return fOrigin ? *fOrigin : kNone;
}

std::vector<ProviderValue> Frame::takeValues(std::size_t count)
{
    std::vector<ProviderValue> values;
    values.swap(fSpareValues);
    values.resize(count);
    return values;
}

void Frame::leaveValues(std::vector<ProviderValue> values) noexcept
{
    if (tCurrent == nullptr || values.capacity() < tCurrent->fSpareValues.capacity()) {
        return;
    }
    for (ProviderValue& value : values) {
        value.reset();
    }
    tCurrent->fSpareValues.swap(values);
}

void Frame::adopt(Owned& object)
{
    object.fPrevious = &fObjects;
    object.fNext = fObjects.fNext;
    fObjects.fNext->fPrevious = &object;
    fObjects.fNext = &object;
}

bool Frame::isOpen(const Frame* frame)
{
    for (const Frame* open = tCurrent; open != nullptr; open = open->fOuter) {
        if (open == frame) {
            return true;
        }
    }
    return false;
}

void Frame::drain()
{
    while (fObjects.fNext != &fObjects) {
        delete fObjects.fNext;
    }
}

} // namespace Pegasus::cmpi
