// SPDX-License-Identifier: MIT
#pragma once

#include "fuzz/cmpi_broker/CallState.h"

#include <functional>
#include <utility>
#include <vector>

namespace fuzz {

// A provider that makes the calls that an input chooses. A function below reads the arguments of one call from the
// input, makes the call, and keeps the objects that it gives.
class CarelessProvider : private CallState
{
  public:
    CarelessProvider(CallInput& in, const CallObjects& call) : CallState(in, call) {}

    // Makes all calls of the input and then releases the clones that are left.
    void run();

  private:
    // MakeObjects.cpp
    void makeSimple();
    void makePath();
    void makeInstance();
    void makeDate();
    void makeArray();
    void makeError();

    // UseObjects.cpp
    void usePath();
    void useDate();
    void useError();
    void useContext();
    void useEnumeration();

    // KeysAndProperties.cpp
    void setKey();
    void readKey();
    void setInstance();
    void readInstance();
    void useArray();
    void setElement();
    void useArgs();

    // BrokerCalls.cpp
    void upcall();
    void change();
    void deliver();
    const void* anyObject();
    void ask();
    void message();
    void unsupported();

    // CarelessProvider.cpp
    template <typename Face> void releaseIn(Places<Face>& places);
    void release();
    template <typename Face> void cloneIn(Places<Face>& places);
    void clone();

    std::vector<std::pair<const void*, std::function<void()>>> fClones;
};

} // namespace fuzz
