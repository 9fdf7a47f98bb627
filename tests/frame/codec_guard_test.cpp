#include "src/frame/codec_guard.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include "src/platform/codec.h"
#include "tests/support/threads.h"

namespace {

using basalt::frame::CodecCalls;
using basalt::frame::CodecGuard;

// A codec that counts its runs and refuses to be started twice or ended with a strange token.
struct FakeCodec {
    std::uintptr_t next_token = 1;
    std::uintptr_t running = 0;
    int starts = 0;
    int faults = 0;
} codec;

constexpr CodecCalls FAKE = {
    .start = []() -> std::uintptr_t {
        ++codec.starts;
        codec.faults += codec.running != 0;
        codec.running = codec.next_token;
        codec.next_token += codec.next_token != 0;
        return codec.running;
    },
    .shut_down =
        [](std::uintptr_t token) {
            codec.faults += token == 0 || token != codec.running;
            codec.running = 0;
        },
};

CodecGuard* guard_in_use = nullptr;

class CodecGuardTest : public testing::Test {
protected:
    void SetUp() override { codec = {}; }
    void TearDown() override {
        EXPECT_EQ(codec.faults, 0);
        EXPECT_EQ(codec.running, 0U);
    }
};

TEST_F(CodecGuardTest, one_run_lasts_from_the_first_start_to_the_last_image) {
    CodecGuard guard(FAKE);
    for (const int run : {1, 2}) {
        guard.AddImage();
        guard.AddImage();
        EXPECT_EQ(codec.running, 0U) << "an image alone starts nothing";
        EXPECT_TRUE(guard.Start());
        EXPECT_TRUE(guard.Start());
        EXPECT_EQ(codec.starts, run);
        guard.ReleaseImage();
        EXPECT_NE(codec.running, 0U);
        guard.ReleaseImage();
        EXPECT_EQ(codec.running, 0U);
    }
    guard.ReleaseImage();  // none is alive
    guard.AddImage();
    EXPECT_TRUE(guard.Start());
    guard.ReleaseImage();
    EXPECT_EQ(codec.running, 0U) << "the count did not wrap";
}

TEST_F(CodecGuardTest, a_codec_that_does_not_start_is_tried_again_and_never_shut_down) {
    CodecGuard guard(FAKE);
    codec.next_token = 0;
    guard.AddImage();
    EXPECT_FALSE(guard.Start());
    EXPECT_FALSE(guard.Start());
    EXPECT_EQ(codec.starts, 2);
    guard.ReleaseImage();
}

TEST_F(CodecGuardTest, unload_ends_a_run_under_way) {
    CodecGuard guard(FAKE);
    guard.AddImage();
    EXPECT_TRUE(guard.Start());
}

TEST_F(CodecGuardTest, a_lock_that_could_not_be_made_keeps_the_codec_from_starting) {
    CodecGuard guard(FAKE, ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(static_cast<std::uint32_t>(guard.LastError()), 0x80070008U);
    guard.AddImage();
    EXPECT_FALSE(guard.Start());
    guard.ReleaseImage();
    EXPECT_EQ(codec.starts, 0);
}

TEST_F(CodecGuardTest, threads_share_one_run) {
    CodecGuard guard(FAKE);
    basalt::test::run_threads(4, [&](int) {
        for (int i = 0; i < 5000; ++i) {
            guard.AddImage();
            EXPECT_TRUE(guard.Start());
            EXPECT_NE(codec.running, 0U) << "no run ends while one of its images is alive";
            guard.ReleaseImage();
        }
    });
}

TEST_F(CodecGuardTest, the_modules_own_runs_the_image_codec) {
    UINT count = 0;
    UINT size = 0;
    basalt::frame::codec_guard.AddImage();
    EXPECT_TRUE(basalt::frame::codec_guard.Start());
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::Ok);
    basalt::frame::codec_guard.ReleaseImage();
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::GdiplusNotInitialized);
}

TEST_F(CodecGuardTest, a_child_forked_while_the_lock_is_held_ends) {
    constexpr CodecCalls FORKING = {
        .start = []() -> std::uintptr_t {
            const pid_t child = fork();
            if (child == 0) {
                alarm(10);
                guard_in_use->~CodecGuard();
                _exit(0);
            }
            int status = -1;
            waitpid(child, &status, 0);
            return status == 0 ? 1 : 0;
        },
        .shut_down = [](std::uintptr_t) {},
    };
    CodecGuard guard(FORKING);
    guard_in_use = &guard;
    EXPECT_TRUE(guard.Start());
}

}  // namespace
