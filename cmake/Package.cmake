# Installing and packing. Two components: `runtime` is what runs (the plug-in, the engine and, on the
# desktop, the command); `development` is what the author of another driver builds against.
include(CMakePackageConfigHelpers)

# Not CMAKE_INSTALL_LIBDIR: the command looks in ../lib/mrtu, on every distribution.
set(MRTU_PLUGIN_DIR lib/mrtu)
set(MRTU_HEADER_DIR ${CMAKE_INSTALL_INCLUDEDIR}/mrtu)
set(MRTU_CMAKE_DIR lib/cmake/mrtu)

install(TARGETS mrtu_plugin COMPONENT runtime LIBRARY DESTINATION ${MRTU_PLUGIN_DIR})
if(MRTU_TOOLS)
  install(TARGETS mrtu COMPONENT runtime RUNTIME DESTINATION bin)
endif()

# mrtu_archive(NAME SOURCES...): mrtu::NAME, an archive that a driver carries inside.
function(mrtu_archive name)
  add_library(mrtu_${name} STATIC ${ARGN})
  set_target_properties(mrtu_${name} PROPERTIES EXPORT_NAME ${name} LINKER_LANGUAGE CXX)
  target_link_libraries(mrtu_${name} PRIVATE $<BUILD_INTERFACE:mrtu_flags>)
endfunction()

# The interfaces alone; what the drivers of the family share; the module object with the host's nine
# service pointers, which each driver defines for itself; the engine.
add_library(mrtu_platform INTERFACE)
set_target_properties(mrtu_platform PROPERTIES EXPORT_NAME platform)
target_include_directories(mrtu_platform INTERFACE $<INSTALL_INTERFACE:${MRTU_HEADER_DIR}>)
target_compile_features(mrtu_platform INTERFACE cxx_std_20)
mrtu_archive(framework $<TARGET_OBJECTS:framework>)
target_link_libraries(mrtu_framework PUBLIC mrtu_platform)
# GNU-unique symbols would keep an unloaded driver in memory for ever.
target_compile_options(mrtu_framework INTERFACE
  $<INSTALL_INTERFACE:$<$<COMPILE_LANG_AND_ID:CXX,GNU>:-fno-gnu-unique>>)
mrtu_archive(module plugin/ProtModule.cpp)
target_link_libraries(mrtu_module PUBLIC mrtu_framework)
target_link_libraries(protgen INTERFACE $<INSTALL_INTERFACE:mrtu_framework>)
set(packaged mrtu_platform mrtu_framework mrtu_module protgen)
set(packaged_headers platform framework engine)
install(FILES plugin/ProtModule.h COMPONENT development DESTINATION ${MRTU_HEADER_DIR}/plugin)

# The run time and the simulated line, for whoever writes a host.
if(MRTU_TOOLS)
  foreach(room wire sim runtime)
    set_target_properties(mrtu_${room} PROPERTIES EXPORT_NAME ${room})
    target_link_libraries(mrtu_${room} PUBLIC $<INSTALL_INTERFACE:mrtu_platform>)
  endforeach()
  list(APPEND packaged mrtu_wire mrtu_sim mrtu_runtime)
  list(APPEND packaged_headers posix wire sim runtime)
endif()

install(TARGETS ${packaged} EXPORT mrtu
  ARCHIVE COMPONENT development DESTINATION ${MRTU_PLUGIN_DIR}
  LIBRARY COMPONENT runtime DESTINATION ${MRTU_PLUGIN_DIR})
install(EXPORT mrtu NAMESPACE mrtu:: FILE mrtu-targets.cmake
  COMPONENT development DESTINATION ${MRTU_CMAKE_DIR})
install(DIRECTORY ${packaged_headers} COMPONENT development DESTINATION ${MRTU_HEADER_DIR}
  FILES_MATCHING PATTERN "*.h")

set(package_folder "${CMAKE_CURRENT_BINARY_DIR}/package")
configure_package_config_file(cmake/package/mrtu-config.cmake.in
  "${package_folder}/mrtu-config.cmake" INSTALL_DESTINATION ${MRTU_CMAKE_DIR})
write_basic_package_version_file("${package_folder}/mrtu-config-version.cmake"
  COMPATIBILITY SameMajorVersion)
set(packaged_texts mrtu)
if(MRTU_TOOLS)
  list(APPEND packaged_texts mrtu-runtime)
endif()
foreach(text ${packaged_texts})
  configure_file(cmake/package/${text}.pc.in "${package_folder}/${text}.pc" @ONLY)
  install(FILES "${package_folder}/${text}.pc" COMPONENT development DESTINATION lib/pkgconfig)
endforeach()
install(FILES "${package_folder}/mrtu-config.cmake" "${package_folder}/mrtu-config-version.cmake"
  COMPONENT development DESTINATION ${MRTU_CMAKE_DIR})

include(Documents)
include(Deb)
