// SPDX-License-Identifier: MIT
#include "pegasus/mof/Delivery.h"

#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <stdexcept>
#include <system_error>

namespace Pegasus::mof {

namespace {

// Classes parsed ahead. The limit bounds the memory, and the work in vain after a class that fails.
constexpr std::size_t kMaxWaiting = 32;

// A compiler that waits for room goes on when so few are left: to wake it after each class costs more than it gains.
constexpr std::size_t kFewWaiting = kMaxWaiting / 2;

// References to more classes than this ask the handler again.
constexpr std::size_t kMaxRememberedNames = 64u << 10;

std::string writtenName(const CIMName& name)
{
    return base::utf8(name.getString());
}

} // namespace

Delivery::~Delivery()
{
    if (!fCreator.joinable()) {
        return;
    }
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        fIsEnding = true;
    }
    fChanged.notify_all();
    fCreator.join();
}

const KnownQualifier* Delivery::findQualifier(const std::string& written)
{
    const auto known = fQualifiers.find(written);
    if (known != fQualifiers.end()) {
        return &known->second;
    }
    finish();
    KnownQualifier found{CIMName(written.c_str()), CIMQualifierDecl()};
    if (!fHandler.findQualifier(found.name, found.declaration)) {
        return nullptr;
    }
    return &fQualifiers.emplace(written, std::move(found)).first->second;
}

bool Delivery::findClass(const CIMName& name, CIMClass& found)
{
    finish();
    return fHandler.findClass(name, found);
}

bool Delivery::hasClass(const CIMName& name)
{
    if (fClassNames.count(writtenName(name)) != 0) {
        return true;
    }
    finish();
    if (!fHandler.hasClass(name)) {
        return false;
    }
    remember(name);
    return true;
}

// What the handler then holds may differ: a server keeps a declaration whose type would change.
void Delivery::declareQualifier(const CIMQualifierDecl& declaration)
{
    finish();
    fQualifiers.clear();
    fHandler.declareQualifier(declaration);
}

bool Delivery::createInstance(const CIMInstance& newInstance)
{
    finish();
    return fHandler.createInstance(newInstance);
}

void Delivery::warn(const SourcePlace& place, const std::string& text)
{
    finish();
    fHandler.warn(place.text(), shownText(text));
}

void Delivery::createClass(const CIMClass& newClass, const SourcePlace& place, const OpenFiles& files)
{
    if (!fCreator.joinable()) {
        startCreator();
    }
    remember(newClass.getClassName());
    std::vector<WaitingClass> created; // ends after the lock
    std::unique_lock<std::mutex> lock(fMutex);
    fChanged.wait(lock, [this] { return fWaiting.size() < kMaxWaiting; });
    created.swap(fCreated);
    if (fFailure) {
        std::rethrow_exception(fFailure);
    }
    fWaiting.push_back({newClass, place, files});
    const bool isFirst = fWaiting.size() == 1;
    lock.unlock();
    if (isFirst) {
        fChanged.notify_all();
    }
}

void Delivery::startCreator()
{
    try {
        fCreator = std::thread([this] { createWaiting(); });
    } catch (const std::system_error& error) {
        throw std::runtime_error("cannot start a thread: " + error.code().message());
    }
}

void Delivery::finish()
{
    std::unique_lock<std::mutex> lock(fMutex);
    fChanged.wait(lock, [this] { return fWaiting.empty(); });
    if (fFailure) {
        std::rethrow_exception(fFailure);
    }
}

// The first class stays in the queue until it is created, so that finish() waits for it.
void Delivery::createWaiting()
{
    std::unique_lock<std::mutex> lock(fMutex);
    for (;;) {
        fChanged.wait(lock, [this] { return fIsEnding || !fWaiting.empty(); });
        if (fIsEnding) {
            return;
        }
        const WaitingClass& first = fWaiting.front(); // stays where it is while others are added
        lock.unlock();
        const std::exception_ptr failure = create(first);
        lock.lock();
        fCreated.push_back(std::move(fWaiting.front()));
        fWaiting.pop_front();
        if (failure) {
            fFailure = failure;
            fWaiting.clear();
        }
        if (fWaiting.empty() || fWaiting.size() == kFewWaiting) {
            fChanged.notify_all();
        }
    }
}

// Returns: null, or what failed.
std::exception_ptr Delivery::create(const WaitingClass& waiting)
{
    try {
        if (!fHandler.createClass(waiting.itsClass)) {
            fHandler.warn(waiting.place.text(), shownText("Class " + writtenName(waiting.itsClass.getClassName()) +
                                                          " already exists in the repository"));
        }
        return nullptr;
    } catch (const Exception& error) {
        MofError atClass(waiting.place, base::utf8(error.getMessage()));
        atClass.addSkipped(countDefinitionsAfter(waiting.files, fLimits));
        return std::make_exception_ptr(atClass);
    } catch (...) {
        return std::current_exception();
    }
}

void Delivery::remember(const CIMName& className)
{
    if (fClassNames.size() >= kMaxRememberedNames) {
        fClassNames.clear();
    }
    fClassNames.insert(writtenName(className));
}

} // namespace Pegasus::mof
