# What all example programs are built of, and how. Needs the Debian package libfmt-dev.
if(NOT TARGET basalt::basalt)
  find_package(basalt REQUIRED)
  enable_testing()
endif()
find_package(fmt REQUIRED)

if(NOT TARGET example_support)
  set(support ${CMAKE_CURRENT_LIST_DIR})
  set(console ${support}/../../console)
  add_library(example_support STATIC
    ${support}/drawing.cpp ${support}/output_file.cpp ${support}/program_options.cpp ${support}/progress.cpp
    ${support}/text.cpp ${console}/command_line.cpp ${console}/csv_reader.cpp ${console}/program.cpp)
  target_include_directories(example_support PUBLIC ${support} ${console})
  target_compile_features(example_support PUBLIC cxx_std_20)
  target_link_libraries(example_support PUBLIC
    basalt::basalt fmt::fmt $<TARGET_NAME_IF_EXISTS:basalt_options>)
endif()

# example_program(<name> <source>...): the program, and its test where that is shipped.
function(example_program name)
  add_executable(${name} ${ARGN})
  target_link_libraries(${name} PRIVATE example_support)
  if(EXISTS ${CMAKE_CURRENT_SOURCE_DIR}/${name}_test.sh)
    add_test(NAME ${name}_command_line COMMAND bash ${CMAKE_CURRENT_SOURCE_DIR}/${name}_test.sh
      $<TARGET_FILE:${name}> ${CMAKE_CURRENT_FUNCTION_LIST_DIR}/../data)
  endif()
endfunction()
