# mrtu_test(NAME SOURCES file... [LIBS target...])
# One GoogleTest program, each of its tests a test of CTest.

if(MRTU_TESTS)
  # The library is built from Debian's source package: with the flags, the sanitizers and the
  # architecture of this build.
  if(EXISTS /usr/src/googletest/CMakeLists.txt)
    set(INSTALL_GTEST OFF CACHE BOOL "" FORCE)
    add_subdirectory(/usr/src/googletest "${CMAKE_BINARY_DIR}/googletest" EXCLUDE_FROM_ALL SYSTEM)
  else()
    message(FATAL_ERROR "GoogleTest's source is missing: apt-get install googletest")
  endif()
  include(GoogleTest)
endif()

function(mrtu_test name)
  cmake_parse_arguments(PARSE_ARGV 1 arg "" "" "SOURCES;LIBS")
  add_executable(${name} ${arg_SOURCES})
  target_link_libraries(${name} PRIVATE mrtu_flags ${arg_LIBS} GTest::gmock_main)
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST PROPERTIES TIMEOUT 300)
endfunction()
