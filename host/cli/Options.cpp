// SPDX-License-Identifier: MIT
#include "host/cli/Options.h"

#include <cstdlib>
#include <filesystem>

#include <sys/ioctl.h>
#include <unistd.h>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

// Never the working directory, which may be anybody's.
// Throws: std::filesystem::filesystem_error.
fs::path ProgramDirectory()
{
    return fs::read_symlink("/proc/self/exe").parent_path();
}

// Paths are the user's, from where the program was started; later the root becomes the working directory.
void MakeAbsolute(std::string& path)
{
    if (!path.empty()) {
        path = fs::absolute(path).lexically_normal();
    }
}

// Of the terminal; a pipe has none.
std::size_t LineWidth()
{
    constexpr std::size_t kDefaultWidth = 80;
    const char* const columns = std::getenv("COLUMNS");
    const long wanted = columns ? std::strtol(columns, nullptr, 10) : 0;
    if (wanted > 0) {
        return static_cast<std::size_t>(wanted);
    }
    winsize size = {};
    return ::ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 0 ? size.ws_col : kDefaultWidth;
}

bool IsColorWanted()
{
    const char* const noColor = std::getenv("NO_COLOR"); // any text but the empty one (no-color.org)
    return ::isatty(STDOUT_FILENO) == 1 && !(noColor && *noColor != '\0');
}

// The format is asked for before the command line is read, because an error in it is reported in that format too.
std::string WantedFormat(int argc, const char* const* argv)
{
    const std::vector<std::string> words(argv + 1, argv + argc);
    constexpr char kOption[] = "--format";
    for (std::size_t i = 0; i < words.size(); ++i) {
        if (words[i] == kOption && i + 1 < words.size()) {
            return words[i + 1];
        }
        if (words[i].rfind(std::string(kOption) + "=", 0) == 0) {
            return words[i].substr(sizeof kOption);
        }
    }
    return "table";
}

void FillDefaults(TOptions& options)
{
    for (std::string* path :
         {&options.fConfigFile, &options.fLogFile, &options.fPlugin, &options.fReplay, &options.fRoot, &options.fState})
    {
        MakeAbsolute(*path);
    }
    if (options.fRoot.empty()) {
        options.fRoot = ProgramDirectory();
    }
}

// Throws: TUsageError when the format cannot hold what the command shows, two records are named, or the command needs
// the machine.
void CheckCommand(TOptions& options)
{
    if (!options.fCommand->IsShownAs(options.fFormat)) {
        throw TUsageError(options.fCommandName + " cannot be shown as " + options.fFormat);
    }
    const std::string replay = options.fCommand->GetReplay();
    if (!replay.empty() && !options.fReplay.empty()) {
        throw TUsageError(options.fCommandName + " names a record of its own: leave --replay out");
    }
    options.fReplay += replay;
    const char* const reason = options.fCommand->WhyNotReplayed();
    if (reason && !options.fReplay.empty()) {
        throw TUsageError(options.fCommandName + " needs the machine itself: " + reason);
    }
}

} // namespace

void SetRoot(const TDeployedTree& tree, TOptions& options)
{
    const std::string root = tree.GetRoot();
    options.fRoot = root;
    options.fTreeConsumer = tree.GetConsumer(options.fConsumer);
    options.fPlansConsumer = tree.HasSettableConsumer();
    if (options.fPlugin.empty()) {
        options.fPlugin = fs::path(root) / kPluginFile;
    }
    if (options.fLogFile.empty()) {
        options.fLogFile = fs::path(root) / kLogFile;
    }
    const fs::path config = fs::path(root) / kConfigFile;
    if (options.fConfigFile.empty() && fs::exists(config)) {
        options.fConfigFile = config;
    }
}

bool ParseOptions(int argc, const char* const* argv, TOptions& options)
{
    options.fFormat = WantedFormat(argc, argv);
    options.fFormatOptions.fWidth = LineWidth();
    options.fFormatOptions.fColor = IsColorWanted();
    if (!ReadCommandLine(argc, argv, options)) {
        return false;
    }
    options.fCommandName = options.fCommand->GetName();
    CheckCommand(options);
    FillDefaults(options);
    return true;
}

} // namespace vrxhost
