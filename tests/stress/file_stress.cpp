// A log that all threads write, mapped blocks and block allocators during clean-ups, files made and deleted,
// queries of the disk, texts, the settings and queries of the environment, and drawing on a thread's own
// objects with one shared brush and palette.
#include <fstream>
#include <string>

#include "basalt/basalt.h"
#include "src/platform/file.h"
#include "tests/stress/stress.h"
#include "tests/support/scratch_folder.h"

namespace basalt::stress {

namespace {

constexpr int THREADS = 6, WIDTH = 40, HEIGHT = 30;

// A new file is neither lost to another thread's DeleteFileW nor does that hit it.
void make_and_delete(const std::wstring& name, int thread) {
    const bool makes = thread % 2 != 0;
    const HANDLE file = !makes ? INVALID_HANDLE_VALUE
                               : CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr,
                                             CREATE_NEW, FILE_FLAG_DELETE_ON_CLOSE, nullptr);
    require(file != INVALID_HANDLE_VALUE || !makes || GetLastError() == ERROR_FILE_EXISTS);
    require(DeleteFileW(name.c_str()) == 0 || file == INVALID_HANDLE_VALUE);
    CloseHandle(file);
}

void use_texts(const CString& name, int thread) {
    require(vex_util::CFilePath::FileExists(name) && !vex_util::CFilePath::IsDirectory(name));
    require(vex_util::Path::GetPath(name, 8) == L".log");
    wchar_t wide[20];
    _char2tchar("\xC3\xBC", wide, 19);
    require(wide[0] == 0xFC && wide[1] == 0);
    _setLanguageVersion(static_cast<basalt_language>(thread + 1));
    require(_languageVersion() >= 1 && _languageVersion() <= THREADS);
    require(_operatingsystem() == 11 && _checkForHighResolution() == 1.0);
    require(_random_uint16() < 65535 && HexStringToString(StringToHexString("abc")) == "abc");
}

void draw_and_write(HBRUSH brush, const ColorPalette& palette, const std::string& path, Random& random) {
    const auto depth = static_cast<UINT>(random() % 2 == 0 ? 24 : 32);
    CBitmap bitmap;
    CDC dc;
    require(bitmap.CreateBitmap(WIDTH, HEIGHT, 1, depth, nullptr) && dc.CreateCompatibleDC(nullptr));
    const HGDIOBJ before = SelectObject(dc, bitmap);
    const RECT all = {0, 0, WIDTH, HEIGHT};
    require(FillRect(dc, &all, brush) != 0 && GetPixel(dc, 3, 3) == 0x0000FF);
    _gradientfill(dc, 5, 5, 35, 25, 6, 0x00FF00, palette[static_cast<unsigned char>(random())], 2.0F, 1);
    require(palette.FindClosestColor(palette[100]) <= 100);
    SelectObject(dc, before);
    CRgn region;
    require(vex_util::mfc::RotateBitmap(&dc, &bitmap, 90.0F));
    require(vex_util::mfc::RegionFromBitmap(region, bitmap, 0x0000FF));
    vex_util::mfc::DumpBitmap(bitmap, CString(path.c_str()));
    require(std::filesystem::file_size(path) == 54 + WIDTH * HEIGHT * depth / 8);
    std::filesystem::remove(path);
}

// Every line is one thread's, whole.
long lines_of(const std::string& path) {
    std::ifstream file(path);
    long lines = 0;
    for (std::string line; std::getline(file, line); ++lines) {
        require(line.size() >= 2 && line.back() == '\r' && line[0] >= '0' && line[0] < '0' + THREADS &&
                line.find_first_not_of(line[0]) == line.size() - 1);
    }
    return lines;
}

}  // namespace

long stress_files(double seconds) {
    const test::ScratchFolder folder;
    const std::string path = folder / "stress.log";
    const CString name(path.c_str());
    vex_util::FileLogger log(path.c_str());
    const HBRUSH brush = CreateSolidBrush(0x0000FF);
    const ColorPalette palette;
    std::atomic<long> written = 0;
    const long rounds = run_threads(THREADS, seconds, [&](int thread, Random& random) {
        log.Write(CString(static_cast<wchar_t>(L'0' + thread), 1 + draw(random, 300)) + L'\n');
        ++written;
        use_texts(name, thread);
        make_and_delete(folder.wide(L"held"), thread);
        draw_and_write(brush, palette, folder / std::to_string(thread) + ".bmp", random);
        if (draw(random, 4) == 0) {
            const auto size = static_cast<unsigned long>(1 + draw(random, 20'000));
            const vex_util::CMemoryMap map(size);
            auto* const bytes = static_cast<char*>(static_cast<void*>(map));
            require(bytes != nullptr && bytes[size - 1]++ == 0);
            vex_lib::vlVmAllocator allocator(4096, 512);
            require(allocator.Alloc(512) != nullptr);
        }
        if (thread == 0) {
            vex_util::CMemoryMap::CleanUp();
            require(vex_util::HiResTimer().GetElapsedS() >= 0 && _currentjavatime() > 0);
        }
    });
    log.Close();
    require(lines_of(path) == written);
    require(folder.names().size() == 1 && DeleteObject(brush) != 0);
    return rounds;
}

}  // namespace basalt::stress
