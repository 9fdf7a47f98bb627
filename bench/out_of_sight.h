// For peers that are compiled together with the loop that times them.
#ifndef BENCH_OUT_OF_SIGHT_H
#define BENCH_OUT_OF_SIGHT_H

namespace bench {

/// The function, called as one of a library is: otherwise the compiler takes the call away, or makes a copy
/// into which it folds what the loop always passes, and the row would compare that and not the work.
template <typename Function>
Function* out_of_sight(Function* function) {
    asm("" : "+r"(function));
    return function;
}

}  // namespace bench

#endif
