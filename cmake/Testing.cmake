# mrtu_test(NAME [DESKTOP] [THREADS] SOURCES file... [LIBS target...])
# One GoogleTest program, each of its tests a test of CTest.
#
# Every test has one of two labels. `portable` tests run on every architecture; `desktop` tests need
# libraries or programs that a cross compiler does not bring, and are left out without MRTU_TOOLS.
# A folder of desktop tests sets MRTU_TEST_LABEL instead of marking each program.
#
# The label of a program whose subject is what several threads do at once ends in "-threads"
# (ctest -L 'threads$'); the target mrtu_threaded_tests builds these, for the thread sanitizer.
set(MRTU_TEST_LABEL portable)

if(MRTU_TESTS)
  add_custom_target(mrtu_threaded_tests)

  # The library is built from Debian's source package: with the flags, the sanitizers and the
  # architecture of this build.
  if(EXISTS /usr/src/googletest/CMakeLists.txt)
    set(INSTALL_GTEST OFF CACHE BOOL "" FORCE)
    add_subdirectory(/usr/src/googletest "${CMAKE_BINARY_DIR}/googletest" EXCLUDE_FROM_ALL SYSTEM)
  else()
    message(FATAL_ERROR "GoogleTest's source is missing: apt-get install googletest")
  endif()
  include(GoogleTest)
  # Tests run once or twice a build: to optimise them as what they test takes longer than they run.
  # The libraries under test stay as they are shipped.
  set(MRTU_TEST_OPTIONS $<$<CONFIG:Release>:-Og>)

  # Its own warnings are its authors' affair.
  foreach(library gtest gmock gmock_main)
    target_compile_options(${library} PRIVATE -w ${MRTU_TEST_OPTIONS})
  endforeach()

  # What every test includes, parsed once.
  file(WRITE "${CMAKE_BINARY_DIR}/test_headers.cpp" "int main() {}\n")
  add_executable(mrtu_test_headers EXCLUDE_FROM_ALL "${CMAKE_BINARY_DIR}/test_headers.cpp")
  target_link_libraries(mrtu_test_headers PRIVATE mrtu_flags GTest::gmock)
  target_compile_options(mrtu_test_headers PRIVATE ${MRTU_TEST_OPTIONS})
  target_precompile_headers(mrtu_test_headers PRIVATE
    <gmock/gmock.h> <gtest/gtest.h> <algorithm> <array> <map> <string> <vector>)
endif()

function(mrtu_test name)
  cmake_parse_arguments(PARSE_ARGV 1 arg "DESKTOP;THREADS" "" "SOURCES;LIBS")
  set(label ${MRTU_TEST_LABEL})
  if(arg_DESKTOP)
    set(label desktop)
  endif()
  if(label STREQUAL "desktop" AND NOT MRTU_TOOLS)
    return()
  endif()
  add_executable(${name} ${arg_SOURCES})
  target_link_libraries(${name} PRIVATE mrtu_flags ${arg_LIBS} GTest::gmock_main)
  target_compile_options(${name} PRIVATE ${MRTU_TEST_OPTIONS})
  target_precompile_headers(${name} REUSE_FROM mrtu_test_headers)
  if(arg_THREADS)
    string(APPEND label "-threads")
    add_dependencies(mrtu_threaded_tests ${name})
  endif()
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST DISCOVERY_TIMEOUT 60
    PROPERTIES TIMEOUT 300 LABELS "${label}")
endfunction()
