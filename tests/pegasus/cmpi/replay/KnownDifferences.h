// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

namespace servertest {

// Why an answer of ours differs from the recorded one on purpose.
enum class Why
{
    kTrap,      // works here and fails on OpenPegasus 2.14; the log warns of it, docs/vendors.md lists it
    kPathKeys,  // the keys of a path fill the key properties
    kNotServed, // associations, queries and class qualifiers have no service here, and the capabilities say so
    kText,      // a sentence for people
    kHost,      // depends on the machine, on threads or on memory that was never set
    kCrash,     // the recorded agent or call ends
    kDefect     // the recorded value is wrong: made up, lost, or against CMPI or CIM-XML
};

const char* nameOf(Why why);

// A part in which the two texts differ. `<*>` in a pattern stands for any text up to what follows it.
struct Edit
{
    const char* ours;
    const char* recorded; // null: the pattern holds in both texts, and the parts that match are left out of both
};

struct KnownDifference
{
    std::vector<const char*> names;
    Why why;
    const char* reason;
    std::vector<Edit> edits; // each is made wherever its pattern matches, and must match
    // The recorded answer ended early: its instances are among ours, in any order, and are left out of both.
    bool isCutShort = false;
};

using KnownDifferences = std::vector<KnownDifference>;

const KnownDifferences& differencesOfVendor();
const KnownDifferences& differencesOfProbes();

// Returns: the row of this name; null without one.
const KnownDifference* findDifference(const KnownDifferences& known, const std::string& name);

// Makes the edits: both texts are equal then, if they differ in those parts only.
// Returns: the first pattern that matches nothing, or the first recorded instance that ours lacks; empty without one.
std::string reconcile(const KnownDifference& known, std::string& ours, std::string& recorded);

} // namespace servertest
