// Memory: sequences of calls on heaps and the block allocator against their models.
#include "tests/support/memory_model.h"

using namespace basalt::test;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    Input input(data, size);
    const unsigned choice = input.byte() % 8;
    if (choice < 2) {
        const unsigned long block = input.byte() % 4 == 0 ? 1 + input.byte() : 4096;
        drive(BlockModel(block * (1 + input.byte() % 35) + input.byte() % block, block), input, 1000);
    } else {
        drive(HeapModel(choice == 4 ? 1 + input.word() % 500'000 : 0), input, 500);
    }
    return 0;
}
