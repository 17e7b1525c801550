// SPDX-License-Identifier: MIT
// The MOF compiler: any text yields definitions, or an error whose place is within the text. A second run must yield
// the same.
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

using namespace Pegasus;
using namespace Pegasus::mof;

namespace {

struct Outcome
{
    std::string diagnostic;
    std::size_t classCount = 0;
    std::size_t instanceCount = 0;
};

// Includes are off, so that no file of the machine is read. The limits are small enough for an input to reach them.
CompileOptions options()
{
    CompileOptions result;
    result.nameSpace = CIMNamespaceName("root/fuzz");
    result.limits.includeCount = 0;
    result.limits.tokenBytes = 64;
    result.limits.stringBytes = 512;
    result.limits.arrayElementCount = 16;
    result.limits.memberCount = 32;
    return result;
}

Outcome compile(const std::string& text)
{
    MemoryHandler handler;
    Outcome outcome;
    try {
        compileText(text, "fuzz.mof", options(), handler);
    } catch (const MofError& error) {
        const auto lineCount = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n')) + 1;
        if (error.place().line > lineCount || error.place().column > text.size() + 1) {
            std::abort();
        }
        outcome.diagnostic = error.diagnostic();
    }
    outcome.classCount = handler.classes().size();
    outcome.instanceCount = handler.instances().size();
    return outcome;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::string text(reinterpret_cast<const char*>(data), size);
    const Outcome first = compile(text);
    const Outcome second = compile(text);
    if (first.diagnostic != second.diagnostic || first.classCount != second.classCount ||
        first.instanceCount != second.instanceCount)
    {
        std::abort();
    }
    return 0;
}
