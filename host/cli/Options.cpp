// SPDX-License-Identifier: MIT
#include "host/cli/Options.h"

#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Loss.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <iostream>

#include <sys/ioctl.h>
#include <unistd.h>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

constexpr int kMaxDeadlineSeconds = 24 * 60 * 60;

constexpr char kFooter[] =
    "Everything runs in the root directory, a deployed tree: the program's own folder unless --root names another.\n"
    "Standard output carries the document alone; standard error reports what was lost.\n"
    "Exit status: 0 complete, 1 failed, 2 wrong usage, 3 partial (something was lost), 4 (diff)\n"
    "something differs, 130 interrupted.";

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

bool SplitSetting(const std::string& text, TOptions& options)
{
    const std::size_t equals = text.find('=');
    if (equals == 0 || equals == std::string::npos) {
        return false;
    }
    options.fSettings.emplace_back(text.substr(0, equals), text.substr(equals + 1));
    return true;
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

void AddFormatOptions(CLI::App& app, TOptions& options)
{
    std::string listed; // the completion reads it
    for (const std::string& name : FormatNames()) {
        listed += (listed.empty() ? "TEXT:{" : ",") + name;
    }
    app.add_option("--format", options.fFormat, "Of the document (default table)")
        ->type_name(listed + "}")
        ->check([](const std::string& name) {
            const std::vector<std::string> names = FormatNames();
            const bool isKnown = std::find(names.begin(), names.end(), name) != names.end();
            return isKnown ? "" : "there is no format " + name + Suggestion(name, names);
        });
    app.add_flag("--all", options.fFormatOptions.fAll, "Show keys too that repeat the class's or the system's name");
    app.add_flag("--raw", options.fFormatOptions.fRaw, "Show numbers as they were delivered");
    app.add_flag("--stable", options.fFormatOptions.fStable,
                 "Leave out what differs between two runs: counters, gauges, times");
}

void AddOptions(CLI::App& app, TOptions& options, std::vector<std::string>& settings)
{
    app.add_option("--consumer", options.fConsumer,
                   "Name that keeps this host's server apart from others' (default: made of the root)");
    app.add_option("--config", options.fConfigFile, "Settings file, lines \"key = value\" (default ROOT/vrx.conf)")
        ->check(CLI::ExistingFile);
    app.add_option("--set", settings, "key=value, before the settings file; may be given several times")
        ->type_size(1)
        ->allow_extra_args(false)
        ->check([](const std::string& text) {
            TOptions ignored;
            return SplitSetting(text, ignored) ? std::string() : "key=value is expected, not \"" + text + "\"";
        });
    app.add_option("--log", options.fLogFile, "The host's log, truncated by each run (default ROOT/vrxhost.log)");
    app.add_option("--plugin", options.fPlugin, "The plug-in (default ROOT/libpegasus.nsp.so)");
    app.add_option("--replay", options.fReplay,
                   "A record (see the command record) in place of this machine: no root, no server");
    app.add_option("--root", options.fRoot, "The root directory")->check(CLI::ExistingDirectory);
    app.add_option(
        "--state", options.fState,
        "A private root, with links to the root's files, for what a run writes (default: the root when it can be "
        "written, else $XDG_STATE_HOME/vrxhost, ~/.local/state/vrxhost or a folder in /tmp)");
    app.add_flag("-v,--verbose", options.fVerbose, "Show the log on standard error too");
    app.add_flag("-q,--quiet", options.fQuiet, "Show no status line on a terminal");
    app.add_option("--deadline", options.fDeadlineSeconds,
                   "Give a provider up after so many seconds, and show what it delivered until then")
        ->check(CLI::Range(1, kMaxDeadlineSeconds));
}

constexpr char kHelpCommand[] = "help";

void AddCommands(CLI::App& app, TOptions& options, std::string& helpTopic)
{
    const auto add = [&app](const char* name, const char* purpose) {
        CLI::App* const added = app.add_subcommand(name, purpose)->fallthrough();
        added->set_help_flag(); // --help is the program's, with all options
        return added;
    };
    for (const std::shared_ptr<ICommand>& command : MakeCommands()) {
        CLI::App* const added = add(command->GetName(), command->GetPurpose());
        command->AddArguments(*added);
        added->callback([&options, command] { options.fCommand = command; });
    }
    add(kHelpCommand, "Describe a command")->add_option("COMMAND", helpTopic, "The command's name");
}

std::vector<std::string> CommandNames(CLI::App& app)
{
    std::vector<std::string> names;
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
        names.push_back(command->get_name());
    }
    return names;
}

std::vector<std::string> OptionNames(const CLI::App& app)
{
    std::vector<std::string> names;
    for (const CLI::Option* option : app.get_options()) {
        for (const std::string& name : option->get_lnames()) {
            names.push_back("--" + name);
        }
    }
    return names;
}

// Refuses a missing command, and the first word that is left over: unknown options before other words.
// Throws: TUsageError.
void RefuseUnknown(CLI::App& app)
{
    const std::vector<std::string> unknown = app.remaining(true);
    for (const std::string& word : unknown) {
        if (word.front() == '-') {
            const std::string name = word.substr(0, word.find('='));
            throw TUsageError("there is no option " + name + Suggestion(name, OptionNames(app)));
        }
    }
    const bool hasCommand = !app.get_subcommands().empty();
    if (!hasCommand && unknown.empty()) {
        throw TUsageError("a command is missing: " + JoinNames(CommandNames(app)) + "; --help describes them");
    }
    if (!hasCommand) {
        throw TUsageError("there is no command " + unknown.front() + Suggestion(unknown.front(), CommandNames(app)));
    }
    if (!unknown.empty()) {
        throw TUsageError("the argument " + unknown.front() + " is one too many");
    }
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

// Throws: TUsageError for an unknown topic.
void ShowHelp(CLI::App& app, const std::string& topic)
{
    const auto names = CommandNames(app);
    if (topic.empty()) {
        app.clear(); // with a command it would be the command's help alone, without the options
        std::cout << app.help();
    } else if (std::find(names.begin(), names.end(), topic) == names.end()) {
        throw TUsageError("there is no command " + topic + Suggestion(topic, names));
    } else {
        std::cout << app.get_subcommand(topic)->help();
    }
}

void FillDefaults(TOptions& options, const std::vector<std::string>& settings)
{
    for (const std::string& setting : settings) {
        SplitSetting(setting, options);
    }
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
    CLI::App app("Shows the inventory that a namespace-provider plug-in serves.", "vrxhost");
    std::vector<std::string> settings;
    std::string helpTopic;
    options.fFormat = WantedFormat(argc, argv);
    options.fFormatOptions.fWidth = LineWidth();
    options.fFormatOptions.fColor = IsColorWanted();
    app.footer(kFooter);
    app.allow_extras();
    app.require_subcommand(0, 1); // what follows a command is its argument, "help get" among them
    app.set_version_flag("--version", std::string("vrxhost ") + VRX_VERSION, "Print the version and exit");
    AddFormatOptions(app, options);
    AddOptions(app, options, settings);
    AddCommands(app, options, helpTopic);
    try {
        app.parse(argc, argv);
    } catch (const CLI::CallForHelp&) {
        ShowHelp(app, "");
        return false;
    } catch (const CLI::CallForVersion& e) {
        std::cout << e.what() << "\n";
        return false;
    } catch (const CLI::ParseError& e) {
        throw TUsageError(e.what());
    }
    RefuseUnknown(app);
    if (!options.fCommand) {
        ShowHelp(app, helpTopic);
        return false;
    }
    options.fCommandName = options.fCommand->GetName();
    CheckCommand(options);
    FillDefaults(options, settings);
    return true;
}

} // namespace vrxhost
