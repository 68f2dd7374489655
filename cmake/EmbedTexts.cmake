# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later

# Writes texts as a C++ source, so that a program carries them. A script:
#   cmake -DTEXTS=A.htm;B.htm -DOUTPUT=data.cpp -DHEADER=x/data.h -DTYPE=HelpPage -DFUNCTION=AllHelpPages -P EmbedTexts.cmake
# HEADER declares `struct TYPE { std::string_view name, text; }` and `std::span<const TYPE> FUNCTION()` in the namespace
# tervane. The names are those of the files, without a folder, in the order of their bytes.
cmake_minimum_required(VERSION 3.25)

foreach(argument TEXTS OUTPUT HEADER TYPE FUNCTION)
  if(NOT DEFINED ${argument})
    message(FATAL_ERROR "EmbedTexts.cmake needs -D${argument}=...")
  endif()
endforeach()

set(delimiter "text")
set(newline_literal "\n)${delimiter}\"\n     R\"${delimiter}(")
# MSVC takes 64 KB of literals joined to one text, and 16 KB of a single one, here a line.
set(longest_text 65000)

foreach(path IN LISTS TEXTS)
  cmake_path(GET path FILENAME name)
  set(path_of_${name} "${path}")
  list(APPEND names "${name}")
endforeach()
list(SORT names COMPARE STRING CASE SENSITIVE)

set(rows "")
foreach(name IN LISTS names)
  file(READ "${path_of_${name}}" text)
  string(REPLACE "\r\n" "\n" text "${text}")
  string(FIND "${text}" ")${delimiter}\"" end_of_literal)
  if(NOT end_of_literal EQUAL -1)
    message(FATAL_ERROR "${name}: holds )${delimiter}\", which ends a raw string. Change the text, or the delimiter.")
  endif()
  string(LENGTH "${text}" length)
  if(length GREATER longest_text)
    message(FATAL_ERROR "${name}: ${length} bytes, at most ${longest_text} can be embedded. Make two texts of it.")
  endif()
  # One literal for each line; the compiler joins them.
  string(REPLACE "\n" "${newline_literal}" text "${text}")
  string(APPEND rows "    {\"${name}\",\n     R\"${delimiter}(${text})${delimiter}\"},\n")
endforeach()

file(WRITE "${OUTPUT}" "// Made by cmake/EmbedTexts.cmake. Change the texts, not this file.
#include \"${HEADER}\"

namespace tervane {
namespace {

constexpr ${TYPE} kTexts[] = {
${rows}};

}  // namespace

std::span<const ${TYPE}> ${FUNCTION}() { return kTexts; }

}  // namespace tervane
")
