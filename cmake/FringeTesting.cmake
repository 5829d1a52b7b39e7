# GoogleTest: Debian's package natively; for the Windows build the source that
# the same package ships, compiled with the cross toolchain and run under Wine.
if(CMAKE_CROSSCOMPILING)
  set(INSTALL_GTEST OFF CACHE BOOL "" FORCE)
  set(BUILD_GMOCK OFF CACHE BOOL "" FORCE)
  set(gtest_force_shared_crt ON CACHE BOOL "" FORCE)
  # GoogleTest is built with the project's code-generation flags but not with
  # its warnings-as-errors, which are meant for our own code.
  get_directory_property(fringe_saved_options COMPILE_OPTIONS)
  set(fringe_gtest_options ${fringe_saved_options})
  list(FILTER fringe_gtest_options EXCLUDE REGEX "^-W")
  set_directory_properties(PROPERTIES COMPILE_OPTIONS "${fringe_gtest_options}")
  add_subdirectory(/usr/src/googletest ${CMAKE_BINARY_DIR}/googletest EXCLUDE_FROM_ALL SYSTEM)
  set_directory_properties(PROPERTIES COMPILE_OPTIONS "${fringe_saved_options}")
  # Newer GoogleTest sources name their targets GTest::* themselves.
  if(NOT TARGET GTest::gtest)
    add_library(GTest::gtest ALIAS gtest)
    add_library(GTest::gtest_main ALIAS gtest_main)
  endif()
else()
  find_package(GTest REQUIRED)
endif()
include(GoogleTest)

# fringe_add_test(name SOURCES ... LIBS ...): one GoogleTest binary, its cases
# discovered at test time so that Wine starts only when the tests run.
function(fringe_add_test name)
  cmake_parse_arguments(T "" "" "SOURCES;LIBS;PROPERTIES" ${ARGN})
  add_executable(${name} ${T_SOURCES})
  target_link_libraries(${name} PRIVATE ${T_LIBS} GTest::gtest_main GTest::gtest)
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST DISCOVERY_TIMEOUT 120
                       PROPERTIES ${T_PROPERTIES})
endfunction()
