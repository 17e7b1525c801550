// SPDX-License-Identifier: MIT
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <vector>

// Compiles each cases/NAME.mof. cases/NAME.expected has what a user reads (the warnings, the error with its line and
// caret, the number of skipped definitions) and how much was delivered.
// With VRX_UPDATE_GOLDEN set in the environment, the expected files are written and the comparison is skipped.

using namespace Pegasus::mof;

namespace {

const std::filesystem::path kCases = MOF_CASES_DIR;

std::string readFile(const std::filesystem::path& path)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

std::string outcome(const std::string& name)
{
    MemoryHandler handler;
    CompileOptions options;
    options.nameSpace = Pegasus::CIMNamespaceName("root/cases");
    std::string diagnostic;
    try {
        compileText(readFile(kCases / name), name, options, handler);
    } catch (const MofError& error) {
        diagnostic = error.diagnostic();
    }
    std::ostringstream text;
    for (const std::string& warning : handler.warnings()) {
        text << warning << "\n";
    }
    text << diagnostic << "delivered: " << handler.qualifiers().size() << " qualifiers, " << handler.classes().size()
         << " classes, " << handler.instances().size() << " instances\n";
    return text.str();
}

std::vector<std::string> caseNames()
{
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(kCases)) {
        if (entry.path().extension() == ".mof") {
            names.push_back(entry.path().stem().string());
        }
    }
    std::sort(names.begin(), names.end());
    return names;
}

} // namespace

class Diagnostics : public testing::TestWithParam<std::string>
{
};

TEST_P(Diagnostics, ReadAsExpected)
{
    const std::filesystem::path expected = kCases / (GetParam() + ".expected");
    const std::string got = outcome(GetParam() + ".mof");
    if (std::getenv("VRX_UPDATE_GOLDEN")) {
        std::ofstream(expected, std::ios::binary) << got;
    }
    EXPECT_EQ(got, readFile(expected));
}

INSTANTIATE_TEST_SUITE_P(Cases, Diagnostics, testing::ValuesIn(caseNames()),
                         [](const testing::TestParamInfo<std::string>& row) { return row.param; });
