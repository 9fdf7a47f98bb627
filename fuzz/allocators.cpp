// Memory: sequences of calls on heaps, the block allocator, the buffer and page sources against their models.
#include "tests/support/memory_model.h"

namespace {

using namespace basalt::test;

template <class Model>
void drive(Model&& model, Input& input, int steps) {
    for (int i = 0; i < steps && !input.is_over(); ++i) {
        model.step(input, [] { return false; });
    }
    model.inspect();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    Input input(data, size);
    switch (input.byte() % 8) {
        case 0:
        case 1: {
            const unsigned long block = input.byte() % 4 == 0 ? 1 + input.byte() : 4096;
            drive(BlockModel(block * (1 + input.byte() % 35) + input.byte() % block, block), input, 1000);
            break;
        }
        case 2:
            drive(BufferModel(input.byte() % 4 == 0 ? 0 : any_size(input)), input, 30);
            break;
        case 3:
            drive(PagesModel(), input, 40);
            break;
        case 4:
            drive(HeapModel(1 + input.word() % 500'000), input, 500);
            break;
        default:
            drive(HeapModel(0), input, 500);
            break;
    }
    return 0;
}
