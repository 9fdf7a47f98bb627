// The first calls of a process, made by all threads at once and by each in another order.
#include <iterator>
#include <latch>
#include <string>

#include "basalt/basalt.h"
#include "tests/stress/stress.h"
#include "tests/support/threads.h"

namespace basalt::stress {

namespace {

using namespace vex_lib;
using namespace vex_util;

constexpr int THREADS = 8;

void convert_a_text() {
    wchar_t wide[8];
    _char2tchar("\xC3\xBC", wide, 7);
    require(wide[0] == 0xFC && wide[1] == 0);
}

void use_an_array() {
    Sparse2DArray array(8, 16, 64);
    require(array.Insert(1, 1, "eight by") && array.Find(1, 1) != nullptr);
}

void (*const CALLS[])() = {
    convert_a_text,
    use_an_array,
    [] { require(_operatingsystem() == 11); },
    [] { require(_handheldVersion() == 1); },
    [] { require(_checkForHighResolution() == 1.0); },
    [] { require(_languageVersion() == 15); },
    [] { require(!_tempFilePath().IsEmpty()); },
    [] { require(HiResTimer().GetElapsedS() >= 0); },
    [] { require(_currentjavatime() > 1'700'000'000'000U); },
    [] { require(VersionInfo().GetMajorVersion() == 1); },
    [] { VersionInfo().InitVersionInfo(nullptr); },
    [] { MACAddressFromMIBTable().Create(); },
    [] { vlSharedMemoryHeap::Free(vlSharedMemoryHeap::Alloc(100)); },
    [] { require(static_cast<void*>(CMemoryMap(100)) != nullptr); },
    [] { require(vlVmAllocator(4096, 4096).Alloc(4096) != nullptr); },
    [] { require(DeleteObject(CreateSolidBrush(1)) != 0); },
    [] { require(GetStockObject(BLACK_PEN) != nullptr); },
    [] { mfc::DumpBitmap(nullptr, CString(L"/nowhere/at.all")); },
    [] { require(IsHexString(StringToHexString(std::string(100, 'x')))); },
};

}  // namespace

long first_use(double) {
    std::latch start(THREADS);
    test::run_threads(THREADS, [&](int thread) {
        start.arrive_and_wait();
        for (std::size_t i = 0; i < std::size(CALLS); ++i) {
            const auto pair = static_cast<std::size_t>(thread / 2);  // so that two always meet
            CALLS[(pair * 5 + i) % std::size(CALLS)]();
        }
    });
    return THREADS * std::ssize(CALLS);
}

}  // namespace basalt::stress
