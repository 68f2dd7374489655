# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later

# A folder is a target: its sources are all that stand in it, so that a new file needs no entry anywhere.

# Warnings are errors in our own code. Targets link this privately, so that nothing exports it. -Wnull-dereference,
# -Warray-bounds, -Wrestrict, -Wstringop-overflow, -Wstringop-overread and -Wmaybe-uninitialized are off: with GCC 12
# they speak of paths through std::string and std::vector that cannot be taken.
add_library(tervane_warnings INTERFACE)
target_compile_options(tervane_warnings INTERFACE
  $<$<CXX_COMPILER_ID:MSVC>:/W4 /WX /utf-8>
  $<$<NOT:$<CXX_COMPILER_ID:MSVC>>:-Wall -Wextra -Wpedantic -Wconversion -Wshadow -Wnon-virtual-dtor
    -Woverloaded-virtual -Wcast-align -Werror>
  $<$<CXX_COMPILER_ID:GNU>:-Wno-array-bounds -Wno-restrict -Wno-stringop-overflow
    -Wno-stringop-overread -Wno-maybe-uninitialized>
  # The build of the fuzzers looks for faults in inputs: what another compiler warns of must not end it.
  $<$<BOOL:${TERVANE_FUZZ}>:-Wno-error>
  # Tables are checked while they are compiled.
  $<$<CXX_COMPILER_ID:Clang>:-fconstexpr-steps=100000000>
  # GCC takes sources that are compiled together for headers.
  $<$<AND:$<BOOL:${CMAKE_UNITY_BUILD}>,$<CXX_COMPILER_ID:GNU>>:-Wno-subobject-linkage>)

# tervane_precompile(TARGET KIND): the headers that nearly every source of a kind includes are read once, by the first
# target of that kind: two thirds of compiling are reading headers. Those of ours are such as change seldom and are
# included by nearly all of the kind anyway. A source still includes what it uses.
set(TERVANE_HEADERS_core <algorithm> <cmath> <functional> <map> <memory> <optional> <string> <string_view>
  <unordered_map> <vector> <fmt/format.h>)
set(TERVANE_HEADERS_model ${TERVANE_HEADERS_core} "${PROJECT_SOURCE_DIR}/core/list.h")
set(TERVANE_HEADERS_pages ${TERVANE_HEADERS_model} "${PROJECT_SOURCE_DIR}/forms/page_rows.h"
  "${PROJECT_SOURCE_DIR}/forms/plots.h" "${PROJECT_SOURCE_DIR}/forms/table_of.h")
set(TERVANE_HEADERS_desktop ${TERVANE_HEADERS_core} <QBoxLayout> <QLabel> <QPainter> <QString> <QToolButton> <QWidget>
  "${PROJECT_SOURCE_DIR}/forms/page.h" "${PROJECT_SOURCE_DIR}/forms/plots.h")
set(TERVANE_HEADERS_test ${TERVANE_HEADERS_core} <gmock/gmock.h> <gtest/gtest.h>)
set(TERVANE_HEADERS_setup_test ${TERVANE_HEADERS_test} "${PROJECT_SOURCE_DIR}/document/flow_model_document.h"
  "${PROJECT_SOURCE_DIR}/forms/page.h")
set(TERVANE_HEADERS_desktop_test ${TERVANE_HEADERS_setup_test} <QApplication> <QWidget> <QtTest>
  "${PROJECT_SOURCE_DIR}/forms/plots.h")
# The folders below the nodes.
set(TERVANE_GROUND platform languages geometry data core)
function(tervane_precompile target kind)
  get_property(first GLOBAL PROPERTY tervane_precompiled_${kind})
  if(first)
    target_precompile_headers(${target} REUSE_FROM ${first})
  else()
    target_precompile_headers(${target} PRIVATE ${TERVANE_HEADERS_${kind}})
    set_property(GLOBAL PROPERTY tervane_precompiled_${kind} ${target})
  endif()
endfunction()

# tervane_library([DESKTOP] LINKS ...): the folder as a library of the folder's name, `tervane_pages_spatial` for
# pages/spatial, without a main.cpp. LINKS are public: who links a floor sees the floors below it. DESKTOP is said where
# the toolkit is used.
function(tervane_library)
  cmake_parse_arguments(ARG "DESKTOP" "" "LINKS" ${ARGN})
  file(RELATIVE_PATH folder ${PROJECT_SOURCE_DIR} ${CMAKE_CURRENT_SOURCE_DIR})
  string(REPLACE "/" "_" name tervane_${folder})
  file(GLOB sources CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/*.cpp)
  list(REMOVE_ITEM sources ${CMAKE_CURRENT_SOURCE_DIR}/main.cpp)
  add_library(${name} STATIC ${sources})
  target_include_directories(${name} PUBLIC ${PROJECT_SOURCE_DIR})
  target_link_libraries(${name} PUBLIC ${ARG_LINKS} PRIVATE tervane_warnings)
  if(ARG_DESKTOP)
    set_target_properties(${name} PROPERTIES AUTOMOC ON)
    tervane_precompile(${name} desktop)
  elseif(folder IN_LIST TERVANE_GROUND)
    tervane_precompile(${name} core)
  elseif(folder MATCHES "^(forms|pages)")
    tervane_precompile(${name} pages)
  else()
    tervane_precompile(${name} model)
  endif()
endfunction()

# tervane_hot(): the library of this folder has loops over millions of values, which -O3 makes faster.
function(tervane_hot)
  file(RELATIVE_PATH folder ${PROJECT_SOURCE_DIR} ${CMAKE_CURRENT_SOURCE_DIR})
  string(REPLACE "/" "_" name tervane_${folder})
  target_compile_options(${name} PRIVATE $<$<AND:$<CONFIG:Release>,$<NOT:$<CXX_COMPILER_ID:MSVC>>>:-O3>)
endfunction()

# tervane_module(NAME FOR TARGET SOURCES ... LINKS ...): a library in bin/ that a target does not link but loads when it
# is first needed (platform/program_module.h), since what it links would cost every start some milliseconds.
function(tervane_module name)
  cmake_parse_arguments(ARG "" "FOR" "SOURCES;LINKS" ${ARGN})
  add_library(${name} MODULE ${ARG_SOURCES})
  target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR})
  target_link_libraries(${name} PRIVATE ${ARG_LINKS} tervane_warnings)
  set_target_properties(${name} PROPERTIES PREFIX "" CXX_VISIBILITY_PRESET hidden VISIBILITY_INLINES_HIDDEN ON
    LIBRARY_OUTPUT_DIRECTORY ${CMAKE_RUNTIME_OUTPUT_DIRECTORY})
  # It must be there when a program runs.
  add_dependencies(${ARG_FOR} ${name})
endfunction()

# tervane_program(NAME SOURCES ... [LINKS ...]): a program in bin/.
function(tervane_program name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LINKS} tervane_warnings)
endfunction()

# tervane_test([DESKTOP] LINKS ...): the GoogleTest program of a folder and all below it, run as one test of the
# folder's name; nothing in a build without unit tests.
function(tervane_test)
  if(NOT TERVANE_UNIT_TESTS)
    return()
  endif()
  cmake_parse_arguments(ARG "DESKTOP" "" "LINKS" ${ARGN})
  get_filename_component(folder ${CMAKE_CURRENT_SOURCE_DIR} NAME)
  file(GLOB_RECURSE sources CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/*_test.cpp
    ${CMAKE_CURRENT_SOURCE_DIR}/*_test_main.cpp)
  add_executable(${folder}_test ${sources})
  target_link_libraries(${folder}_test PRIVATE ${ARG_LINKS} tervane_test_support GTest::gmock GTest::gtest_main
    tervane_warnings)
  target_compile_definitions(${folder}_test PRIVATE TERVANE_SOURCE_DIR="${PROJECT_SOURCE_DIR}"
    TERVANE_BIN_DIR="${CMAKE_RUNTIME_OUTPUT_DIRECTORY}")
  set_target_properties(${folder}_test PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/tests)
  if(ARG_DESKTOP)
    set_target_properties(${folder}_test PROPERTIES AUTOMOC ON)
    tervane_precompile(${folder}_test desktop_test)
  elseif(folder IN_LIST TERVANE_GROUND)
    tervane_precompile(${folder}_test test)
  else()
    tervane_precompile(${folder}_test setup_test)
  endif()
  # Most of a test is run once: compiling it is what takes time.
  target_compile_options(${folder}_test PRIVATE $<$<NOT:$<CXX_COMPILER_ID:MSVC>>:-O0>)
  add_test(NAME ${folder} COMMAND ${folder}_test)
endfunction()
