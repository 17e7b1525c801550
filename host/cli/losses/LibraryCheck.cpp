// SPDX-License-Identifier: MIT
#include "host/cli/losses/LibraryCheck.h"

#include "host/cli/losses/LinePattern.h"
#include "host/cli/losses/RegistrationText.h"
#include "host/core/TChildProcess.h"

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <sstream>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

constexpr char kLoader[] = "/lib64/ld-linux-x86-64.so.2"; // the platform's, by its ABI
constexpr int kLoaderTimeoutSeconds = 10;

std::string SearchPath(const TVendorFiles& files, const std::string& root)
{
    std::string path = root + "/pegasus/lib:" + root;
    for (const TVendorFolder& folder : files.GetFolders()) {
        path += ":" + folder.fPath;
    }
    return path;
}

// What ldd -r does: the loader lists what it would load and bind.
NKOLVRX20::TProcessOutcome AskLoader(const std::string& library, const std::string& searchPath)
{
    NKOLVRX20::TProcessRequest request;
    request.fProgram = kLoader;
    request.fArguments = {kLoader, library};
    request.fEnvironment = {"LD_TRACE_LOADED_OBJECTS=1", "LD_WARN=yes", "LD_BIND_NOW=yes",
                            "LD_LIBRARY_PATH=" + searchPath};
    return NKOLVRX20::TChildProcess(request).Run(std::chrono::seconds(kLoaderTimeoutSeconds));
}

void AddMissing(std::vector<std::string>& missing, const std::string& text)
{
    constexpr std::size_t kShown = 5;
    if (missing.size() < kShown && std::find(missing.begin(), missing.end(), text) == missing.end()) {
        missing.push_back(text);
    }
}

// Returns: what is missing, as text; empty for a library that loads. What a missing library would define is left out.
std::string DescribeMissing(const NKOLVRX20::TProcessOutcome& outcome)
{
    std::vector<std::string> libraries;
    std::vector<std::string> symbols;
    std::istringstream lines(outcome.fOutput + "\n" + outcome.fErrorOutput);
    for (std::string line; std::getline(lines, line);) {
        line.resize(std::min(line.size(), kMaxMatchedBytes)); // the name of a symbol may have any length
        line.erase(0, line.find_first_not_of(" \t"));
        if (const auto library = MatchLine("<word> => not found", line)) {
            AddMissing(libraries, "the library " + library->front() + " is missing");
        } else if (const auto symbol = MatchLine("undefined symbol: <word><text>", line)) {
            const std::string name = symbol->front(); // a comma and the symbol's version may follow
            AddMissing(symbols, "the symbol " + name.substr(0, name.find(',')) + " is missing");
        } else if (const auto other = MatchLine("<text>error while loading shared libraries: <text>", line)) {
            AddMissing(libraries, other->back());
        }
    }
    return JoinNames(libraries.empty() ? symbols : libraries);
}

bool Exists(const std::string& name, const TVendorFiles& files, const std::string& root)
{
    const auto isIn = [&name](const std::string& folder) { return fs::exists(fs::path(folder) / name); };
    return isIn(root + "/pegasus/lib") ||
           std::any_of(files.GetFolders().begin(), files.GetFolders().end(),
                       [&isIn](const TVendorFolder& folder) { return isIn(folder.fPath); });
}

void Enter(TLossLog& losses, const TVendorFolder& folder, const std::string& file, ELossKind kind,
           const std::string& sentence)
{
    TLoss loss = LossOf(kind, sentence);
    loss.fVendor = folder.fName;
    loss.fFile = file;
    losses.Add(loss);
}

void CheckLocations(const TVendorFolder& folder, const TVendorFiles& files, const std::string& root, TLossLog& losses)
{
    for (const std::string& path : folder.fRegistrations) {
        for (const std::string& location : LocationsOf(path)) {
            const std::string name = "lib" + location + ".so";
            if (!Exists(name, files, root)) {
                Enter(losses, folder, path, ELossKind::kLocation,
                      "the library " + name + " (Location) is in no vendor's folder");
            }
        }
    }
}

} // namespace

void CheckLibraries(const TVendorFiles& files, const std::string& root, TLossLog& losses)
{
    const std::string searchPath = SearchPath(files, root);
    for (const TVendorFolder& folder : files.GetFolders()) {
        CheckLocations(folder, files, root, losses);
        for (const std::string& library : folder.fLibraries) {
            const std::string missing = DescribeMissing(AskLoader(library, searchPath));
            if (!missing.empty()) {
                Enter(losses, folder, library, ELossKind::kLibrary, "the library cannot be loaded: " + missing);
            }
        }
    }
}

} // namespace vrxhost
