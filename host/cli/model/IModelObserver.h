// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>

namespace vrxhost {

// Sees the contract's objects while they are collected; instances then stay out of the document. Calls come in this
// order: BeginProvider, for each of its classes BeginClass, Add for each instance, EndClass.
class IModelObserver
{
  public:
    virtual ~IModelObserver() = default;
    virtual void BeginProvider(const TProviderRecord& provider) = 0;
    virtual void BeginClass(NKOLVRX20::ICIMClass& each, const TClassRecord& record) = 0;
    virtual void Add(const NKOLVRX20::ICIMInstance& instance) = 0;
    virtual void EndClass(const TClassRecord& record) = 0; // with the count and the time
};

} // namespace vrxhost
