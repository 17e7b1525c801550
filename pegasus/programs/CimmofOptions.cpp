// SPDX-License-Identifier: MIT
#include "pegasus/programs/CimmofOptions.h"

namespace Pegasus::cimmof {

const char* const kHelp =
    "Usage: cimmof [options] file...\n"
    "Compiles MOF files into the CIM server of $PEGASUS_HOME.\n"
    "\n"
    "  -n, --namespace NAMESPACE  target namespace, created if missing (root/cimv2)\n"
    "  -I, --include DIRECTORY    look for included files there as well; may be repeated\n"
    "  --any-include              include files outside the folder of FILE and the -I folders, too\n"
    "  --strict                   refuse what OpenPegasus 2.14's compiler refuses, instead of warning\n"
    "  -aE                        accept classes with a true Experimental qualifier\n"
    "  -E                         check the files without a server\n"
    "  -w                         no warnings\n"
    "  -h, --help                 this text\n"
    "\n"
    "Exit status: 0 done; 250 error in a file or from the server; 249 a file cannot be opened;\n"
    "2 it was opened but cannot be read; 247 bad namespace; 246 no server; 254 bad command line; "
    "255 after this text.\n";

namespace {

// Walks over the arguments.
class Arguments
{
  public:
    explicit Arguments(const std::vector<std::string>& all) : fAll(all) {}

    bool atEnd() const { return fNext == fAll.size(); }
    const std::string& take() { return fAll[fNext++]; }
    std::string takeValue(const std::string& option)
    {
        if (atEnd()) {
            throw OptionError("Missing value for flag " + option);
        }
        return take();
    }

  private:
    const std::vector<std::string>& fAll;
    std::size_t fNext = 0;
};

bool setSwitch(Options& options, const std::string& flag)
{
    if (flag == "-h" || flag == "--help") {
        options.showHelp = true;
    } else if (flag == "-E") {
        options.syntaxOnly = true;
    } else if (flag == "-w") {
        options.hideWarnings = true;
    } else if (flag == "-aE") {
        options.allowExperimental = true;
    } else if (flag == "--any-include") {
        options.includesAny = true;
    } else if (flag == "--strict") {
        options.isStrict = true;
    } else {
        return false;
    }
    return true;
}

bool startsWith(const std::string& text, const char* start)
{
    return text.rfind(start, 0) == 0;
}

void setValue(Options& options, const std::string& flag, Arguments& arguments)
{
    if (flag == "-uc") {
        throw OptionError("Flag uc is not supported: this server does not replace classes");
    }
    if (flag == "-n" || flag == "--namespace") {
        options.nameSpace = arguments.takeValue("n");
    } else if (flag == "-I" || flag == "--include") {
        options.includeDirectories.push_back(arguments.takeValue("I"));
    } else if (startsWith(flag, "-n")) {
        options.nameSpace = flag.substr(2);
    } else if (startsWith(flag, "-I")) {
        options.includeDirectories.push_back(flag.substr(2));
    } else {
        throw OptionError("Unknown flag " + flag.substr(flag.find_first_not_of('-')));
    }
}

} // namespace

Options parseOptions(const std::vector<std::string>& all)
{
    Options options;
    Arguments arguments(all);
    while (!arguments.atEnd()) {
        const std::string& argument = arguments.take();
        if (argument.find_first_not_of('-') == std::string::npos || argument[0] != '-') {
            options.files.push_back(argument);
        } else if (!setSwitch(options, argument)) {
            setValue(options, argument, arguments);
        }
    }
    return options;
}

} // namespace Pegasus::cimmof
