# How every target of the project is compiled.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)

# One flat set of rooms: libraries and programs lie side by side, so that $ORIGIN finds the engine.
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/out")
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/out")

if(NOT CMAKE_BUILD_TYPE)
  set(CMAKE_BUILD_TYPE Release CACHE STRING "" FORCE)
endif()

add_library(mrtu_flags INTERFACE)
target_include_directories(mrtu_flags INTERFACE "${CMAKE_SOURCE_DIR}" "${CMAKE_BINARY_DIR}")
target_compile_options(mrtu_flags INTERFACE
  -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Wformat=2 -Werror
  # g++ 12 sees overlapping copies inside "text" + std::string where there are none.
  $<$<AND:$<COMPILE_LANGUAGE:CXX>,$<CXX_COMPILER_ID:GNU>,$<VERSION_LESS:$<CXX_COMPILER_VERSION>,13>>:-Wno-restrict>
  # What g++ 7 changed on ARM does not matter to a build with one compiler.
  $<$<AND:$<COMPILE_LANGUAGE:CXX>,$<CXX_COMPILER_ID:GNU>,$<STREQUAL:${CMAKE_SYSTEM_PROCESSOR},armv7l>>:-Wno-psabi>
  # GNU-unique symbols would keep an unloaded plug-in in memory for ever.
  $<$<AND:$<COMPILE_LANGUAGE:CXX>,$<CXX_COMPILER_ID:GNU>>:-fno-gnu-unique>)

if(MRTU_SANITIZE)
  add_compile_options(-fsanitize=${MRTU_SANITIZE} -fno-omit-frame-pointer
    -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${MRTU_SANITIZE})
endif()

# Headers of other projects are system headers: their warnings are theirs.
find_package(Threads REQUIRED)

# mrtu_shared_library(TARGET EXPORTS): what plug-in and engine have in common.
function(mrtu_shared_library target exports)
  # The same run path in the build tree: what CMake pads it with there is an empty entry, by which
  # the loader understands the current folder.
  set_target_properties(${target} PROPERTIES
    INSTALL_RPATH "$ORIGIN" BUILD_WITH_INSTALL_RPATH ON
    LINK_DEPENDS "${exports}")
  # Each calls its own copy of the framework's functions, whoever stands first in the look-up order:
  # an exception must not pass from one library into the other. Data stay shared.
  target_link_options(${target} PRIVATE "-Wl,-Bsymbolic-functions")
  target_link_options(${target} PRIVATE "-Wl,--version-script=${exports}" "-Wl,--gc-sections")
  if(MRTU_STATIC_RUNTIME)
    target_link_options(${target} PRIVATE -static-libstdc++ -static-libgcc -Wl,--exclude-libs,ALL)
    target_sources(${target} PRIVATE
      "${CMAKE_SOURCE_DIR}/cmake/StaticRuntime.cpp" "${CMAKE_SOURCE_DIR}/cmake/ThrownHere.cpp")
  endif()
endfunction()
