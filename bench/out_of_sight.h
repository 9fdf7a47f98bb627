// For peers that are compiled together with the loop that times them.
#ifndef BENCH_OUT_OF_SIGHT_H
#define BENCH_OUT_OF_SIGHT_H

namespace bench {

/// Hides which function is called, as for one in a library: otherwise the compiler would inline it, or fold
/// the loop's constant arguments into a copy of it.
template <typename Function>
Function* out_of_sight(Function* function) {
    asm("" : "+r"(function));
    return function;
}

}  // namespace bench

#endif
