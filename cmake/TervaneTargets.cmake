# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later

# Warnings are errors in our own code. Targets link this privately, so that nothing exports it. -Wnull-dereference and
# -Wrestrict are off: with GCC 12 at -O3 they speak of paths through std::string and std::vector that cannot be taken.
add_library(tervane_warnings INTERFACE)
target_compile_options(tervane_warnings INTERFACE
  $<$<CXX_COMPILER_ID:MSVC>:/W4 /WX /utf-8>
  $<$<NOT:$<CXX_COMPILER_ID:MSVC>>:-Wall -Wextra -Wpedantic -Wconversion -Wshadow -Wnon-virtual-dtor
    -Woverloaded-virtual -Wcast-align -Werror>
  $<$<CXX_COMPILER_ID:GNU>:-Wno-restrict>)

# tervane_library(NAME [SOURCES ...] [LINKS ...]): one folder, one library `tervane_NAME`; without sources it has headers
# alone. LINKS are public: who links a floor sees the floors below it.
function(tervane_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  if(NOT ARG_SOURCES)
    add_library(tervane_${name} INTERFACE)
    target_link_libraries(tervane_${name} INTERFACE ${ARG_LINKS})
    return()
  endif()
  add_library(tervane_${name} STATIC ${ARG_SOURCES})
  target_include_directories(tervane_${name} PUBLIC ${PROJECT_SOURCE_DIR})
  target_link_libraries(tervane_${name} PUBLIC ${ARG_LINKS} PRIVATE tervane_warnings)
endfunction()

# tervane_program(NAME SOURCES ... [LINKS ...]): a program in bin/.
function(tervane_program name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LINKS} tervane_warnings)
endfunction()

# tervane_test(FOLDER SOURCES ... LINKS ...): the GoogleTest program of one folder, run as one test.
function(tervane_test folder)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${folder}_test ${ARG_SOURCES})
  target_link_libraries(${folder}_test PRIVATE ${ARG_LINKS} tervane_test_support GTest::gmock GTest::gtest_main
    tervane_warnings)
  target_compile_definitions(${folder}_test PRIVATE TERVANE_SOURCE_DIR="${PROJECT_SOURCE_DIR}"
    TERVANE_BIN_DIR="${CMAKE_RUNTIME_OUTPUT_DIRECTORY}")
  set_target_properties(${folder}_test PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/tests)
  add_test(NAME ${folder} COMMAND ${folder}_test)
endfunction()
