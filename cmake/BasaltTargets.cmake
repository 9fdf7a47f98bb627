# Compile options of this project's own targets, not of its users.
#
# -ffp-contract=off: a fused multiply-add rounds once where the documented order of operations rounds twice,
# and results are fixed to the bit.

add_library(basalt_options INTERFACE)
target_compile_features(basalt_options INTERFACE cxx_std_20)
target_compile_options(basalt_options INTERFACE -ffp-contract=off)
if(BASALT_IS_TOP_LEVEL)
  target_compile_options(basalt_options INTERFACE -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
endif()

# Hardening costs nothing measurable here. Fortified calls need optimisation, and sanitizers replace them.
option(BASALT_HARDEN "Fortified calls, guarded stacks and return addresses, read-only tables" ${BASALT_IS_TOP_LEVEL})
if(BASALT_HARDEN AND NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  target_compile_options(basalt_options INTERFACE -fstack-protector-strong -fstack-clash-protection
    $<$<NOT:$<CONFIG:Debug>>:-U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=3>)
  if(CMAKE_SYSTEM_PROCESSOR MATCHES "x86_64|AMD64")
    target_compile_options(basalt_options INTERFACE -fcf-protection)
  endif()
  target_link_options(basalt_options INTERFACE -Wl,-z,relro,-z,now,-z,noexecstack)
endif()

# Reproducible: the same bytes from any folder.
target_compile_options(basalt_options INTERFACE -ffile-prefix-map=${PROJECT_SOURCE_DIR}=.
  -ffile-prefix-map=${PROJECT_BINARY_DIR}=build)
