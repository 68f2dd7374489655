# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later

# Writes a man page of what a program says of itself by --help, and one for each of its commands, so that they tell what
# the program does. A script:
#   cmake -DPROGRAM=bin/tervane -DVERSION=0.1.0 -DFOLDER=man -P ManPages.cmake
cmake_minimum_required(VERSION 3.25)

cmake_path(GET PROGRAM STEM name)
file(MAKE_DIRECTORY ${FOLDER})

# Runs `PROGRAM ... --help`; the text goes to `out`.
function(help_of out)
  execute_process(COMMAND ${CMAKE_COMMAND} -E env QT_QPA_PLATFORM=offscreen ${PROGRAM} ${ARGN} --help
    OUTPUT_VARIABLE text RESULT_VARIABLE status)
  if(NOT status EQUAL 0)
    message(FATAL_ERROR "${PROGRAM} ${ARGN} --help: ${status}")
  endif()
  set(${out} "${text}" PARENT_SCOPE)
endfunction()

# A page of a help text, whose first line says what it is for.
function(write_page page text)
  string(REGEX MATCH "^[^\n]*" purpose "${text}")
  string(REGEX REPLACE "\\.$" "" purpose "${purpose}")
  string(FIND "${text}" "\n" end)
  string(SUBSTRING "${text}" ${end} -1 text)
  # A backslash is an escape, and a point or quote that begins a line a request.
  string(REPLACE "\\" "\\e" text "${text}")
  string(REPLACE "\n." "\n\\&." text "${text}")
  string(REPLACE "\n'" "\n\\&'" text "${text}")
  string(TOUPPER "${page}" title)
  string(REPLACE "-" "\\-" shown "${page}")
  file(WRITE ${FOLDER}/${page}.1 ".TH \"${title}\" 1 \"\" \"Tervane ${VERSION}\" \"Tervane\"
.SH NAME
${shown} \\- ${purpose}
.SH SYNOPSIS
.nf${text}.fi
.SH SEE ALSO
.BR tervane (1),
.BR quarzel (1)
")
endfunction()

help_of(whole)
write_page(${name} "${whole}")
# What stands below "Subcommands:", a name at the begin of each line.
if(whole MATCHES "\nSubcommands:\n(.*)")
  string(REGEX MATCHALL "\n  [a-z0-9-]+" commands "\n${CMAKE_MATCH_1}")
  foreach(command ${commands})
    string(STRIP "${command}" command)
    help_of(text ${command})
    write_page(${name}-${command} "${text}")
  endforeach()
endif()
