# Compile options of this project's own targets; consumers get none of them.
#
# -ffp-contract=off: a fused multiply-add rounds once where the documented order of operations rounds twice,
# and results are fixed to the bit.

add_library(basalt_options INTERFACE)
target_compile_features(basalt_options INTERFACE cxx_std_20)
target_compile_options(basalt_options INTERFACE -ffp-contract=off)
if(BASALT_IS_TOP_LEVEL)
  target_compile_options(basalt_options INTERFACE -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
endif()
