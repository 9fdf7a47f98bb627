#include "src/frame/codec_guard.h"

#include <gtest/gtest.h>

#include "src/platform/codec.h"

namespace {

using basalt::frame::CodecGuard;

// A codec that counts its runs, and as a fault each run within another and each wrong token.
struct FakeCodec {
    bool is_used = false;
    bool works = true;
    int starts = 0;
    std::uintptr_t running = 0;
    int faults = 0;
} codec;

}  // namespace

// The linker's --wrap puts these in place of GdiplusStartup and GdiplusShutdown.
extern "C" {
using Startup = Gdiplus::Status(std::uintptr_t*, const GdiplusStartupInput*, GdiplusStartupOutput*);
Startup __real__Z14GdiplusStartupPmPK19GdiplusStartupInputP20GdiplusStartupOutput;
Gdiplus::Status __wrap__Z14GdiplusStartupPmPK19GdiplusStartupInputP20GdiplusStartupOutput(
    std::uintptr_t* token, const GdiplusStartupInput* input, GdiplusStartupOutput* output) {
    if (!codec.is_used) {
        return __real__Z14GdiplusStartupPmPK19GdiplusStartupInputP20GdiplusStartupOutput(token, input,
                                                                                         output);
    }
    codec.faults += codec.running != 0 || input->GdiplusVersion != 1;
    *token = static_cast<std::uintptr_t>(++codec.starts);
    codec.running = codec.works ? *token : 0;
    return codec.works ? Gdiplus::Ok : Gdiplus::GenericError;
}
void __real__Z15GdiplusShutdownm(std::uintptr_t token);
void __wrap__Z15GdiplusShutdownm(std::uintptr_t token) {
    if (!codec.is_used) {
        return __real__Z15GdiplusShutdownm(token);
    }
    codec.faults += token == 0 || token != codec.running;
    codec.running = 0;
}
}

namespace {

TEST(CodecGuard, one_run_lasts_from_the_first_start_to_the_last_image) {
    codec = {.is_used = true};
    {
        CodecGuard guard;
        for (const int run : {1, 2}) {
            guard.AddImage();
            guard.AddImage();
            EXPECT_EQ(codec.running, 0U) << "an image alone starts nothing";
            EXPECT_TRUE(guard.Start() && guard.Start());
            EXPECT_EQ(codec.starts, run);
            guard.ReleaseImage();
            EXPECT_NE(codec.running, 0U);
            guard.ReleaseImage();
            EXPECT_EQ(codec.running, 0U);
            guard.ReleaseImage();  // none is alive
        }
        codec.works = false;
        guard.AddImage();
        EXPECT_FALSE(guard.Start() || guard.Start());
        EXPECT_EQ(codec.starts, 4) << "tried again";
        codec.works = true;
        EXPECT_TRUE(guard.Start());
    }
    EXPECT_TRUE(codec.running == 0 && codec.faults == 0) << "the guard's end is the codec's";
    CodecGuard without_lock(ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(static_cast<std::uint32_t>(without_lock.LastError()), 0x80070008U);
    EXPECT_FALSE(without_lock.Start());
    codec = {};
    UINT count = 0;
    UINT size = 0;
    basalt::frame::codec_guard.AddImage();
    EXPECT_TRUE(basalt::frame::codec_guard.Start());
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::Ok) << "the module's own, and the real codec";
    basalt::frame::codec_guard.ReleaseImage();
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::GdiplusNotInitialized);
}

}  // namespace
