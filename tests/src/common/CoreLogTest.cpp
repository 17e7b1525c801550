// SPDX-License-Identifier: MIT
// The plug-in lives in the host's process, whose locale it neither sets nor follows.
#include "src/common/CoreLog.h"

#include <gtest/gtest.h>

#include <locale>
#include <string>

namespace NKOLVRX20 {
namespace {

class TGrouping : public std::numpunct<char>
{
  protected:
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

TEST(CoreLog, NumbersArePlainInAHostThatGroupsDigits)
{
    const std::locale before = std::locale::global(std::locale(std::locale::classic(), new TGrouping));
    const std::string text = JoinText("port ", 65535, " after ", 1000000L, " ms");
    std::locale::global(before);
    EXPECT_EQ("port 65535 after 1000000 ms", text);
}

} // namespace
} // namespace NKOLVRX20
