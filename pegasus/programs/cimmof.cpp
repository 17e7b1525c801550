// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"
#include "pegasus/mof/MofError.h"
#include "pegasus/programs/CimmofHandler.h"
#include "pegasus/programs/CimmofOptions.h"
#include "pegasus/server/admin/ConfigFile.h"
#include "pegasus/server/admin/Daemon.h"
#include "pegasus/server/admin/Log.h"

#include <functional>
#include <iostream>

using namespace Pegasus;
using namespace Pegasus::cimmof;

namespace {

// Exit statuses, as OpenPegasus's compiler has them.
enum Status
{
    kDone = 0,
    kUnreadableFile = 2,
    kNoServer = 246,
    kBadNamespace = 247,
    kNoFile = 249,
    kFailed = 250,
    kBadCommandLine = 254,
    kHelpShown = 255
};

Status compileOne(const std::string& file, const mof::CompileOptions& options, mof::DefinitionHandler& handler)
{
    try {
        mof::compileFile(file, options, handler);
        return kDone;
    } catch (const mof::MofError& error) {
        std::cerr << error.diagnostic();
        return kFailed;
    } catch (const mof::FileError& error) {
        std::cerr << error.what() << "\n";
        return error.kind() == mof::FileError::Kind::kNotOpened ? kNoFile : kUnreadableFile;
    } catch (const Exception& error) {
        std::cerr << mof::shownText(file + ": error: " + base::utf8(error.getMessage())) << "\n";
        return kFailed;
    }
}

// An error ends its own file only; the first one decides the exit status.
Status compileAll(const Options& options, const mof::CompileOptions& compileOptions, mof::DefinitionHandler& handler)
{
    Status status = kDone;
    for (const std::string& file : options.files) {
        const Status ofFile = compileOne(file, compileOptions, handler);
        status = status == kDone ? ofFile : status;
    }
    return status;
}

Status checkSyntax(const Options& options, const mof::CompileOptions& compileOptions)
{
    mof::MemoryHandler handler;
    const Status status = compileAll(options, compileOptions, handler);
    if (!options.hideWarnings) {
        for (const std::string& warning : handler.warnings()) {
            std::cerr << warning << "\n";
        }
    }
    return status;
}

Status compileIntoServer(const Options& options, const mof::CompileOptions& compileOptions)
{
    CIMClient client;
    try {
        client.connectLocal();
    } catch (const Exception&) {
        std::cerr << "Cannot connect to CIM Server. The CIM Server may not be running.\n";
        return kNoServer;
    }
    server::Log::open(server::defaultHome(), false);
    ServerHandler handler(client, options.hideWarnings);
    return compileAll(options, compileOptions, handler);
}

// The server's property holds for its compiler too; whoever runs the compiler for a host cannot pass an option.
bool isServerStrict()
{
    return server::readConfigFile(server::currentConfigPath(server::defaultHome()))["strictProviders"] == "true";
}

Status run(const Options& options)
{
    if (options.showHelp) {
        std::cout << kHelp;
        return kHelpShown;
    }
    if (!CIMNamespaceName::legal(String(options.nameSpace.c_str()))) {
        std::cerr << "Error: invalid CIM namespace name: " << options.nameSpace
                  << "\nFailed to set DefaultNamespacePath.\n";
        return kBadNamespace;
    }
    if (options.files.empty()) {
        return kDone;
    }
    mof::CompileOptions compileOptions;
    compileOptions.nameSpace = CIMNamespaceName(options.nameSpace.c_str());
    compileOptions.includeDirectories = options.includeDirectories;
    compileOptions.includesAny = options.includesAny;
    compileOptions.allowExperimental = options.allowExperimental;
    compileOptions.isStrict = options.isStrict || isServerStrict();
    return options.syntaxOnly ? checkSyntax(options, compileOptions) : compileIntoServer(options, compileOptions);
}

} // namespace

int main(int argc, char** argv)
{
    server::openStandardDescriptors();
    try {
        return run(parseOptions(std::vector<std::string>(argv + 1, argv + argc)));
    } catch (const OptionError& error) {
        std::cerr << argv[0] << ": Command line errors:\n> " << error.what() << "\n\n"
                  << argv[0] << ": Use '--help' to obtain command syntax.\n";
        return kBadCommandLine;
    } catch (const Exception& error) {
        std::cerr << "cimmof: " << base::utf8(error.getMessage()) << "\n";
    } catch (const std::exception& error) {
        std::cerr << "cimmof: " << error.what() << "\n";
    }
    return kFailed;
}
