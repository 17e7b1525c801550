// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Loss.h"

#include <string>

namespace vrxhost {

// Whose programs a tree was staged with.
enum class EServerKind
{
    kEmbedded, // this project's
    kInstalled // an installed OpenPegasus's
};

// The file, below the root, that only staging writes.
inline constexpr char kTreeMark[] = "pegasus/tree.conf";

// Why a directory is refused as root, as a sentence. Thrown before anything is changed or run.
class TTreeError : public TFailure
{
  public:
    using TFailure::TFailure;
};

// A root that was staged for vrxhost. The server's repository below it is deleted by each run, so a folder that merely
// looks similar (a source tree, somebody's own OpenPegasus) must not be taken for one: the mark pegasus/tree.conf,
// which only staging writes, pegasus/bin/cimserver and pegasus/pegSchema are all required.
class TDeployedTree
{
  public:
    // Throws: TTreeError.
    explicit TDeployedTree(const std::string& root);

    const std::string& GetRoot() const { return fRoot; } // absolute, links resolved
    std::string GetId() const;                           // made of the root: letters and digits
    // Returns: where a run writes when it may write there, as the mark of an installed package says, whose own folders
    // are read-only; empty for the tree itself.
    const std::string& GetState() const { return fState; }

    // Returns: the consumer that keeps this tree's server apart from other trees': the wanted one or, when that is
    // empty, one made of the root's path. An installed OpenPegasus was built for one consumer, which the mark names.
    // Throws: TTreeError when that is another one than the wanted.
    std::string GetConsumer(const std::string& wanted) const;
    // Returns: whether the server has to get its consumer from the host.
    bool HasSettableConsumer() const { return fKind == EServerKind::kEmbedded; }

  private:
    std::string fRoot;
    EServerKind fKind;
    std::string fBuiltConsumer; // of an installed OpenPegasus
    std::string fState;
};

} // namespace vrxhost
