// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentOutput.h"

#include <gtest/gtest.h>

#include <chrono>
#include <string>
#include <vector>

namespace Pegasus::server {
namespace {

// A provider's output: what is logged of it, and what the error of its failure quotes.
TEST(AgentOutputTest, linesAreBoundedInLengthAndRate)
{
    std::vector<std::string> logged;
    OutputLines lines([&](const std::string& line) { logged.push_back(line); });
    const OutputLines::Clock::time_point start = OutputLines::Clock::now();
    lines.feed("one\n\x1b[2Jt", start);
    lines.feed("wo\n" + std::string(10'000, 'x'), start);
    lines.feed("y\n", start);
    ASSERT_EQ(logged.size(), 3u);
    EXPECT_EQ(logged[2], std::string(OutputLines::kMaxOutputLineBytes, 'x'));
    EXPECT_EQ(lines.tail(), "one | \\x1b[2Jtwo | " + logged[2]);

    for (unsigned i = 0; i < 1000; ++i) {
        lines.feed("flood\n", start);
    }
    EXPECT_EQ(logged.size(), OutputLines::kMaxOutputLines);
    lines.feed("later\n", start + std::chrono::seconds(2));
    EXPECT_EQ(logged[logged.size() - 2], "(903 lines left out)");
    EXPECT_EQ(logged.back(), "later");
    lines.feed("\xff no newline", start);
    lines.finish();
    EXPECT_LE(lines.tail().size(), OutputLines::kMaxTailBytes);
    EXPECT_NE(lines.tail().find("flood | later | \xef\xbf\xbd no newline"), std::string::npos);
}

} // namespace
} // namespace Pegasus::server
