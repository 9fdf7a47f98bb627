#include "src/frame/codec_guard.h"

#include <gtest/gtest.h>

#include "src/platform/codec.h"

namespace {

bool works = true;
std::uintptr_t starts = 0, running = 0;
int faults = 0;  // runs within another and wrong tokens

}  // namespace

// The linker's --wrap puts these in place of GdiplusStartup and GdiplusShutdown.
extern "C" {
Gdiplus::Status __wrap__Z14GdiplusStartupPmPK19GdiplusStartupInputP20GdiplusStartupOutput(
    std::uintptr_t* token, const GdiplusStartupInput* input, GdiplusStartupOutput*) {
    faults += running != 0 || input->GdiplusVersion != 1;
    *token = ++starts;
    running = works ? *token : 0;
    return works ? Gdiplus::Ok : Gdiplus::GenericError;
}
void __wrap__Z15GdiplusShutdownm(std::uintptr_t token) {
    faults += token == 0 || token != running;
    running = 0;
}
}

TEST(CodecGuard, one_run_lasts_from_the_first_start_to_the_last_image) {
    {
        basalt::frame::CodecGuard guard;
        for (const std::uintptr_t run : {1U, 2U}) {
            guard.AddImage(), guard.AddImage();
            EXPECT_EQ(running, 0U) << "an image alone starts nothing";
            EXPECT_TRUE(guard.Start() && guard.Start() && running == run);
            for (const std::uintptr_t left : {run, std::uintptr_t{0}, std::uintptr_t{0}}) {
                guard.ReleaseImage();  // the third time, none is alive
                EXPECT_EQ(running, left);
            }
        }
        works = false;
        EXPECT_FALSE(guard.Start() || guard.Start());
        works = true;
        EXPECT_TRUE(guard.Start() && starts == 5) << "a start that failed is repeated";
    }
    basalt::frame::CodecGuard without_lock(ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(static_cast<std::uint32_t>(without_lock.LastError()), 0x80070008U);
    EXPECT_TRUE(!without_lock.Start() && running == 0 && faults == 0) << "the guard's end is the codec's";
}
