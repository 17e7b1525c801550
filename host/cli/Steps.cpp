// SPDX-License-Identifier: MIT
#include "host/cli/Steps.h"

namespace vrxhost {
namespace {

constexpr int kFetchSeconds = 5; // the plug-in's, for a class

struct TLineRule
{
    const char* fBegin;
    const char* fStep;
    bool fIsPath; // what follows the beginning is a vendor's file, else a class
    int fTimeoutSeconds;
};

const TLineRule kLineRules[] = {
    {"Entering TPEGASUSNamespace::regProvider: ", "registering ", true, 0},
    {"Entering TPEGASUSNamespace::ffinishRegProvider: ", "reading the classes of ", true, 0},
    {"TPEGASUSNamespace::GetClass from Pegasus for: ", "fetching class ", false, kFetchSeconds},
};

// "/r/pegasus/provider/linux/linux.classes.xml"
std::string VendorOf(const std::string& path)
{
    constexpr char kFolder[] = "/provider/";
    const std::size_t at = path.find(kFolder);
    if (at == std::string::npos) {
        return "";
    }
    const std::string below = path.substr(at + sizeof kFolder - 1);
    return below.substr(0, below.find('/'));
}

std::string FileName(const std::string& path)
{
    return path.substr(path.rfind('/') + 1);
}

} // namespace

std::optional<TStep> StepOfLine(const std::string& line)
{
    constexpr char kRestart[] = " try to restart cimserver ";
    const std::size_t restart = line.find(kRestart);
    if (restart != std::string::npos) {
        return TStep{"starting the server once more", 0};
    }
    for (const TLineRule& rule : kLineRules) {
        const std::string begin = rule.fBegin;
        if (line.rfind(begin, 0) == 0) {
            const std::string object =
                line.substr(begin.size(), line.find_first_of(" \n", begin.size()) - begin.size());
            return TStep{rule.fStep + (rule.fIsPath ? "vendor " + VendorOf(object) : object), rule.fTimeoutSeconds};
        }
    }
    return std::nullopt;
}

TStep StepOfProgram(const std::vector<std::string>& arguments, int timeoutSeconds)
{
    const std::string program = arguments.empty() ? "" : arguments.front();
    std::string text = "running " + program;
    if (program == "cimserver") {
        const bool isStop = arguments.back() == "-s";
        text = isStop ? "stopping the server" : "starting the server";
    } else if (program == "cimconfig") {
        text = "configuring the server";
    } else if (program == "cimmof") {
        const std::string vendor = VendorOf(arguments.back());
        text = vendor.empty() ? "compiling the base schema" : "registering vendor " + vendor;
        text += ", " + FileName(arguments.back());
    }
    return {text, timeoutSeconds};
}

TStep StepOfClass(const std::string& provider, const std::string& className, const TVendorFiles& vendors)
{
    const TClassList* const list = vendors.FindClass(className);
    return {"vendor " + provider + ", class " + className, list ? list->TimeoutOf(className) : 0};
}

void TStepLog::Log(EVRXLogSeverity severity, const std::string& text)
{
    if (const auto step = StepOfLine(text)) {
        fLine.Show(*step);
    }
    fNext.Log(severity, text);
}

} // namespace vrxhost
