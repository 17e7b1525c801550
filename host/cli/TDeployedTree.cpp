// SPDX-License-Identifier: MIT
#include "host/cli/TDeployedTree.h"

#include <cinttypes>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

constexpr char kServerKey[] = "server = ";
constexpr char kEmbedded[] = "embedded";
constexpr char kInstalled[] = "installed OpenPegasus";
constexpr char kConsumerKey[] = "consumer = ";
constexpr char kStateKey[] = "state = ";
constexpr char kFormatLine[] = "format = 1";

[[noreturn]] void Refuse(const std::string& root, const std::string& reason)
{
    throw TTreeError(ELossKind::kNotDeployed, "the root directory " + root + " is not a deployed tree: " + reason);
}

// What the mark says.
struct TMark
{
    EServerKind fKind;
    std::string fConsumer;
    std::string fState;
};

TMark ReadMark(const std::string& root)
{
    std::ifstream mark(fs::path(root) / kTreeMark);
    if (!mark) {
        Refuse(root, std::string("it has no readable ") + kTreeMark);
    }
    bool hasFormat = false;
    std::string server;
    std::string consumer;
    std::string state;
    for (std::string line; std::getline(mark, line);) {
        if (line == kFormatLine) {
            hasFormat = true;
        } else if (line.rfind(kServerKey, 0) == 0) {
            server = line.substr(sizeof kServerKey - 1);
        } else if (line.rfind(kConsumerKey, 0) == 0) {
            consumer = line.substr(sizeof kConsumerKey - 1);
        } else if (line.rfind(kStateKey, 0) == 0) {
            state = line.substr(sizeof kStateKey - 1);
        }
    }
    const bool isKnown = server == kEmbedded || (server == kInstalled && !consumer.empty());
    if (!hasFormat || !isKnown) {
        Refuse(root, std::string("this program does not know the kind of tree that ") + kTreeMark + " names");
    }
    return {server == kEmbedded ? EServerKind::kEmbedded : EServerKind::kInstalled, consumer, state};
}

// FNV-1a: the same in every build, because a later one must find the server that an earlier one left running.
std::uint64_t Hash(const std::string& text)
{
    std::uint64_t hash = 14695981039346656037u;
    for (const char c : text) {
        hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211u;
    }
    return hash;
}

std::string Resolved(const std::string& root)
{
    std::error_code error;
    const fs::path resolved = fs::canonical(root, error);
    if (error) {
        throw TTreeError(ELossKind::kRoot, "the root directory " + root + " could not be entered: " + error.message());
    }
    return resolved;
}

} // namespace

TDeployedTree::TDeployedTree(const std::string& root) : fRoot(Resolved(root))
{
    const TMark mark = ReadMark(fRoot);
    fKind = mark.fKind;
    fBuiltConsumer = mark.fConsumer;
    fState = mark.fState;
    std::error_code ignored;
    if (!fs::is_regular_file(fs::path(fRoot) / "pegasus/bin/cimserver", ignored)) {
        Refuse(fRoot, "it has no program pegasus/bin/cimserver");
    }
    if (!fs::is_directory(fs::path(fRoot) / "pegasus/pegSchema", ignored)) {
        Refuse(fRoot, "it has no folder pegasus/pegSchema");
    }
}

std::string TDeployedTree::GetId() const
{
    char text[32];
    std::snprintf(text, sizeof text, "%016" PRIx64, Hash(fRoot));
    return text;
}

std::string TDeployedTree::GetConsumer(const std::string& wanted) const
{
    if (fKind == EServerKind::kEmbedded) {
        return wanted.empty() ? "vrxhost-" + GetId() : wanted;
    }
    if (!wanted.empty() && wanted != fBuiltConsumer) {
        throw TTreeError("the server of the tree " + fRoot + " was built for the consumer " + fBuiltConsumer +
                         " and knows no other: leave --consumer out");
    }
    return fBuiltConsumer;
}

} // namespace vrxhost
