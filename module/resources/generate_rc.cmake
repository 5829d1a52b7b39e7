# Writes the module's resource script from its description.
#   cmake -DOUTPUT=<file.rc> -DFRINGE_VERSION=a.b.c.d -P generate_rc.cmake
# The script is rewritten only when its text changes, so that an unchanged
# description does not relink the module.

cmake_minimum_required(VERSION 3.25)

if(NOT OUTPUT OR NOT FRINGE_VERSION MATCHES "^[0-9]+\\.[0-9]+\\.[0-9]+\\.[0-9]+$")
  message(FATAL_ERROR "usage: cmake -DOUTPUT=<file.rc> -DFRINGE_VERSION=a.b.c.d -P generate_rc.cmake")
endif()
string(REPLACE "." ", " FRINGE_VERSION_TEXT "${FRINGE_VERSION}")

include(${CMAKE_CURRENT_LIST_DIR}/resource_script.cmake)
set_property(GLOBAL PROPERTY RC_SCRIPT "// Generated from fringe_resources.cmake; do not edit.\n")
include(${CMAKE_CURRENT_LIST_DIR}/fringe_resources.cmake)

get_property(script GLOBAL PROPERTY RC_SCRIPT)
set(previous "")
if(EXISTS "${OUTPUT}")
  file(READ "${OUTPUT}" previous)
endif()
if(NOT previous STREQUAL script)
  file(WRITE "${OUTPUT}" "${script}")
endif()
