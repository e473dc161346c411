#include <fcntl.h>
#include <gtest/gtest.h>

#include <cerrno>

#include "Pipe.h"

namespace {

bool isOpen(int descriptor) { return fcntl(descriptor, F_GETFD) != -1; }

TEST(PipeTest, CarriesBytesUntilTheWriterCloses) {
    zemPipe pipe;
    ASSERT_EQ(pipe.openPipe(), 0);
    char data[8] = {};
    EXPECT_EQ(pipe.write("abc", 4), 4);
    EXPECT_EQ(pipe.read(data, sizeof data), 4);
    EXPECT_STREQ(data, "abc");
    const int writer = pipe.getWritingPipe();
    EXPECT_EQ(pipe.closeWritingPipe() + pipe.closeWritingPipe() + pipe.getWritingPipe(), 0);
    EXPECT_FALSE(isOpen(writer));
    EXPECT_EQ(pipe.read(data, sizeof data), 0);
}

TEST(PipeTest, MissingEndsAreAnErrorAndNoMore) {
    zemPipe pipe;
    char data[8] = {};
    EXPECT_EQ(pipe.read(data, sizeof data), -1) << "not from standard input";
    EXPECT_EQ(errno, EBADF);
    EXPECT_EQ(pipe.write(data, sizeof data), -1);
    EXPECT_EQ(errno, EBADF);
    ASSERT_EQ(pipe.openPipe(), 0);
    pipe.closeReadingPipe();
    EXPECT_EQ(pipe.write(data, sizeof data), -1) << "without SIGPIPE";
    EXPECT_EQ(errno, EPIPE);
}

TEST(PipeTest, DestructorClosesWhatItStillHolds) {
    int fds[2];
    {
        zemPipe opened;
        ASSERT_EQ(opened.openPipe(), 0);
        fds[0] = opened.getReadingPipe();
        fds[1] = opened.getWritingPipe();
        opened.detach();
    }
    ASSERT_TRUE(isOpen(fds[0]) && isOpen(fds[1]));
    {
        zemPipe attached;
        attached.attach(fds);
        attached.attach(nullptr);
    }
    EXPECT_FALSE(isOpen(fds[0]) || isOpen(fds[1]));
}

}  // namespace
