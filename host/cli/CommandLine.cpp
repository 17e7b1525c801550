// SPDX-License-Identifier: MIT
#include "host/cli/Options.h"
#include "host/cli/commands/IArguments.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Loss.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <filesystem>
#include <iostream>

namespace vrxhost {
namespace {

constexpr int kMaxDeadlineSeconds = 24 * 60 * 60;

constexpr char kFooter[] =
    "Everything runs in the root directory, a deployed tree: the program's own folder unless --root names another.\n"
    "Standard output carries the document alone; standard error reports what was lost.\n"
    "Exit status: 0 complete, 1 failed, 2 wrong usage, 3 partial (something was lost), 4 (diff)\n"
    "something differs, 130 interrupted.";

// Each value has the option before it.
void AddRepeated(CLI::App& app, const char* name, std::vector<std::string>& texts, IArguments::TRefusal refusal,
                 const char* purpose)
{
    app.add_option(name, texts, purpose)->type_size(1)->allow_extra_args(false)->check(refusal);
}

// An unset variable of a script makes such a text: it would stand for the default, and --replay "" for a run.
std::string RefuseEmpty(const std::string& text)
{
    return text.empty() ? "a name is expected, not an empty text" : "";
}

class TCommandArguments : public IArguments
{
  public:
    explicit TCommandArguments(CLI::App& command) : fCommand(command) {}

    void AddText(const char* name, std::string& text, const char* purpose) override
    {
        fCommand.add_option(name, text, purpose)->required();
    }
    void AddPath(const char* name, ENeed need, std::string& path, const char* purpose) override
    {
        fCommand.add_option(name, path, purpose)
            ->required(need == ENeed::kRequired)
            ->check(RefuseEmpty)
            ->transform(
                [](const std::string& text) { return text.empty() ? text : std::filesystem::absolute(text).string(); });
    }
    void AddRest(const char* name, std::vector<std::string>& words, const char* purpose) override
    {
        fCommand.add_option(name, words, purpose);
    }
    void AddFlag(const char* name, bool& isSet, const char* purpose) override
    {
        fCommand.add_flag(name, isSet, purpose);
    }
    void AddListOption(const char* name, std::vector<std::string>& texts, const char* purpose) override
    {
        fCommand.add_option(name, texts, purpose)->delimiter(',');
    }
    void AddRepeatedOption(const char* name, std::vector<std::string>& texts, TRefusal refusal,
                           const char* purpose) override
    {
        AddRepeated(fCommand, name, texts, refusal, purpose);
    }

  private:
    CLI::App& fCommand;
};

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

std::string RefuseSetting(const std::string& text)
{
    const std::size_t equals = text.find('=');
    return equals == 0 || equals == std::string::npos ? "key=value is expected, not \"" + text + "\"" : "";
}

void AddOptions(CLI::App& app, TOptions& options, std::vector<std::string>& settings)
{
    app.add_option("--consumer", options.fConsumer,
                   "Name that keeps this host's server apart from others' (default: made of the root)")
        ->check(RefuseEmpty);
    app.add_option("--config", options.fConfigFile, "Settings file, lines \"key = value\" (default ROOT/vrx.conf)")
        ->check(CLI::ExistingFile);
    AddRepeated(app, "--set", settings, RefuseSetting,
                "key=value, before the settings file; may be given several times");
    app.add_option("--log", options.fLogFile, "The host's log, truncated by each run (default ROOT/vrxhost.log)")
        ->check(RefuseEmpty);
    app.add_option("--plugin", options.fPlugin, "The plug-in (default ROOT/libpegasus.nsp.so)")->check(RefuseEmpty);
    app.add_option("--replay", options.fReplay,
                   "A record (see the command record) in place of this machine: no root, no server")
        ->check(RefuseEmpty);
    app.add_option("--root", options.fRoot, "The root directory")->check(CLI::ExistingDirectory);
    app.add_option(
           "--state", options.fState,
           "A private root, with links to the root's files, for what a run writes (default: the root when it can be "
           "written, else $XDG_STATE_HOME/vrxhost, ~/.local/state/vrxhost or a folder in /tmp)")
        ->check(RefuseEmpty);
    app.add_flag("-v,--verbose", options.fVerbose, "Show the log on standard error too");
    app.add_flag("-q,--quiet", options.fQuiet, "Show no status line on a terminal");
    app.add_option(
           "--deadline", options.fDeadlineSeconds,
           "Give a provider up after so many seconds, and show what it delivered until then; they count from its "
           "first class, after the server's start")
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
        TCommandArguments arguments(*added);
        command->AddArguments(arguments);
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

// Returns: the commands that have the option.
std::vector<std::string> CommandsWith(CLI::App& app, const std::string& option)
{
    std::vector<std::string> names;
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
        if (command->get_option_no_throw(option) != nullptr) {
            names.push_back(command->get_name());
        }
    }
    return names;
}

// Throws: TUsageError.
[[noreturn]] void RefuseOption(CLI::App& app, const std::string& name)
{
    const std::vector<std::string> others = CommandsWith(app, name);
    if (others.empty()) {
        throw TUsageError("there is no option " + name + Suggestion(name, OptionNames(app)));
    }
    const std::vector<CLI::App*> used = app.get_subcommands();
    throw TUsageError((used.empty() ? "a command is missing, and " : used.front()->get_name() + " has no option ") +
                      name + (used.empty() ? " belongs to " : "; it belongs to ") + JoinNames(others));
}

// Refuses a missing command, and the first word that is left over: unknown options before other words.
// Throws: TUsageError.
void RefuseUnknown(CLI::App& app)
{
    const std::vector<std::string> unknown = app.remaining(true);
    for (const std::string& word : unknown) {
        if (word.front() == '-') {
            RefuseOption(app, word.substr(0, word.find('=')));
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

} // namespace

bool ReadCommandLine(int argc, const char* const* argv, TOptions& options)
{
    CLI::App app("Shows the inventory that a namespace-provider plug-in serves.", "vrxhost");
    std::vector<std::string> settings;
    std::string helpTopic;
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
    for (const std::string& setting : settings) {
        const std::size_t equals = setting.find('=');
        options.fSettings.emplace_back(setting.substr(0, equals), setting.substr(equals + 1));
    }
    return true;
}

} // namespace vrxhost
