// The first calls of a process, made by all threads at once and by each in another order.
#include <iterator>
#include <latch>
#include <string>

#include "basalt/basalt.h"
#include "tests/stress/stress.h"
#include "tests/support/threads.h"

namespace basalt::stress {

namespace {

constexpr int THREADS = 8;

void convert_a_text() {
    wchar_t wide[8];
    _char2tchar("\xC3\xBC", wide, 7);
    require(wide[0] == 0xFC && wide[1] == 0, "the encoding");
}

void use_the_shared_heap() {
    void* const block = vex_lib::vlSharedMemoryHeap::Alloc(100);
    require(block != nullptr, "the shared heap");
    vex_lib::vlSharedMemoryHeap::Free(block);
}

void use_an_array() {
    vex_util::Sparse2DArray array(8, 16, 64);
    require(array.Insert(1, 1, "eight by") && array.Find(1, 1) != nullptr, "a lock's barriers");
}

void (*const CALLS[])() = {
    [] { require(_operatingsystem() == 11, "the release"); },
    [] { require(_handheldVersion() == 1, "the desktop"); },
    [] { require(_checkForHighResolution() == 1.0, "the factor"); },
    [] { require(_languageVersion() == 15, "the language"); },
    [] { require(!_tempFilePath().IsEmpty(), "the folder"); },
    convert_a_text,
    [] { require(vex_util::HiResTimer().GetElapsedS() >= 0, "the clock"); },
    [] { require(_currentjavatime() > 1'700'000'000'000U, "the epoch"); },
    [] { require(VersionInfo().GetMajorVersion() == 1, "no version yet"); },
    [] { static_cast<void>(VersionInfo().InitVersionInfo(nullptr)); },
    [] { static_cast<void>(MACAddressFromMIBTable().Create()); },
    use_the_shared_heap,
    [] { require(static_cast<void*>(vex_util::CMemoryMap(100)) != nullptr, "the table of handles"); },
    [] { require(vex_lib::vlVmAllocator(4096, 4096).Alloc(4096) != nullptr, "a temporary file"); },
    [] { require(DeleteObject(CreateSolidBrush(1)) != 0, "the table of drawing objects"); },
    [] { require(GetStockObject(BLACK_PEN) != nullptr, "the stock objects"); },
    [] { vex_util::mfc::DumpBitmap(nullptr, CString(L"/nowhere/at.all")); },
    [] { require(IsHexString(StringToHexString(std::string(100, 'x'))), "the choice of a codec"); },
    use_an_array,
};

}  // namespace

long first_use() {
    std::latch start(THREADS);
    test::run_threads(THREADS, [&](int thread) {
        start.arrive_and_wait();
        for (std::size_t i = 0; i < std::size(CALLS); ++i) {
            const auto pair = static_cast<std::size_t>(thread / 2);  // so that two always meet
            CALLS[(pair * 5 + i) % std::size(CALLS)]();
        }
    });
    return THREADS * static_cast<long>(std::size(CALLS));
}

}  // namespace basalt::stress
