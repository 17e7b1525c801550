// SPDX-License-Identifier: MIT
// Owners of descriptors, and deadlines.
#include "pegasus/base/Deadline.h"
#include "pegasus/base/Descriptor.h"

#include <gtest/gtest.h>

#include <cerrno>

#include <fcntl.h>
#include <poll.h>

namespace Pegasus::base {
namespace {

using std::chrono::milliseconds;

bool isOpen(int fd)
{
    return ::fcntl(fd, F_GETFD) >= 0;
}

int newDescriptor()
{
    return ::open("/dev/null", O_RDONLY | O_CLOEXEC);
}

TEST(DescriptorTest, ClosesWhatItOwnsOnceAndNothingElse)
{
    const int first = newDescriptor();
    const int second = newDescriptor();
    const int released = newDescriptor();
    {
        Descriptor owner(first);
        owner = Descriptor(second);
        EXPECT_FALSE(isOpen(first)) << "replaced";
        Descriptor moved(std::move(owner));
        EXPECT_TRUE(isOpen(second));
        EXPECT_EQ(moved.get(), second);
        Descriptor kept(released);
        EXPECT_EQ(kept.release(), released);
        EXPECT_FALSE(kept);
    }
    EXPECT_FALSE(isOpen(second));
    EXPECT_TRUE(isOpen(released));
    ::close(released);
}

TEST(DescriptorTest, ClosingKeepsTheErrorOfTheCallBefore)
{
    errno = ENOENT;
    Descriptor(1 << 20).reset(); // close() fails with EBADF
    EXPECT_EQ(errno, ENOENT);
}

TEST(DeadlineTest, TimeoutOfPoll)
{
    struct Row
    {
        const char* name;
        Deadline deadline;
        int least, most;
        bool hasPassed;
    };
    const int biggest = std::numeric_limits<int>::max();
    const std::vector<Row> rows = {
        {"never", Deadline::never(), -1, -1, false},
        {"0 as never", Deadline::afterOrNever(milliseconds(0)), -1, -1, false},
        {"a minute or never", Deadline::afterOrNever(milliseconds(60000)), 1, 60000, false},
        {"at once", Deadline::after(milliseconds(0)), 0, 0, true},
        {"before", Deadline::after(milliseconds(-5000)), 0, 0, true},
        {"a minute", Deadline::after(milliseconds(60000)), 1, 60000, false},
        {"longer than poll can count", Deadline::after(std::chrono::hours(24 * 365)), biggest, biggest, false},
        {"longer than the clock can count", Deadline::after(milliseconds::max()), -1, -1, false},
    };
    for (const Row& row : rows) {
        const int timeout = row.deadline.pollTimeoutMs();
        EXPECT_GE(timeout, row.least) << row.name;
        EXPECT_LE(timeout, row.most) << row.name;
        EXPECT_EQ(row.deadline.hasPassed(), row.hasPassed) << row.name;
    }
}

TEST(DeadlineTest, AWaitOfPollDoesNotEndBeforeIt)
{
    const Deadline deadline = Deadline::after(milliseconds(3));
    EXPECT_EQ(::poll(nullptr, 0, deadline.pollTimeoutMs()), 0);
    EXPECT_TRUE(deadline.hasPassed());
}

} // namespace
} // namespace Pegasus::base
