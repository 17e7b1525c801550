// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMNamespace.h>

#include <boost/shared_ptr.hpp>

#include <map>
#include <string>

#include <sys/types.h>

namespace soak {

enum class EAnswer
{
    kRight,
    kLess, // nothing, or a part of it: what a fault may cost
    kWrong
};

// What a host asks of a namespace, and whether the answers are those that the vendors of the soak give.
// Ownership: releases everything that came from the plug-in when it is destroyed.
// Thread: one at a time.
class TInventory
{
  public:
    explicit TInventory(NKOLVRX20::ICIMNamespace& ns);

    // The instances of the probe: every one once, with its values.
    EAnswer EnumerateProbe();
    // A text through the probe and back.
    EAnswer InvokeEcho(const std::string& text);
    // This machine's processors.
    EAnswer EnumerateProcessors();

    // A class whose provider never ends its answer. Returns: whether the call gave up.
    EAnswer EnumerateEndless();
    // A method whose provider starts a process and crashes.
    EAnswer ForkAndCrash();

    // Returns: the process that runs the probe's library; 0 when the probe fails to answer.
    pid_t ProbeProcess();

  private:
    boost::shared_ptr<NKOLVRX20::ICIMClass> FindClass(const std::string& name);

    NKOLVRX20::ICIMNamespace& fNamespace;
    std::map<std::string, boost::shared_ptr<NKOLVRX20::ICIMClass>> fClasses;
    boost::shared_ptr<NKOLVRX20::ICIMInstance> fProbe; // one of those enumerated; methods are called on it
};

} // namespace soak
