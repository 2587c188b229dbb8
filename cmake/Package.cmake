# Installing and packing. Two components: `runtime` is what runs (the plug-in, the engine and, on the
# desktop, the command); `development` is what the author of another driver builds against.
include(CMakePackageConfigHelpers)

# Not CMAKE_INSTALL_LIBDIR: the command looks in ../lib/mrtu, on every distribution.
set(MRTU_PLUGIN_DIR lib/mrtu)
set(MRTU_HEADER_DIR ${CMAKE_INSTALL_INCLUDEDIR}/mrtu)
set(MRTU_CMAKE_DIR lib/cmake/mrtu)

install(TARGETS mrtu_plugin protgen COMPONENT runtime LIBRARY DESTINATION ${MRTU_PLUGIN_DIR})
if(TARGET mrtu)
  install(TARGETS mrtu COMPONENT runtime RUNTIME DESTINATION bin)
endif()

# The interfaces alone, and the framework that a driver carries inside.
add_library(mrtu_platform INTERFACE)
set_target_properties(mrtu_platform PROPERTIES EXPORT_NAME platform)
target_include_directories(mrtu_platform INTERFACE $<INSTALL_INTERFACE:${MRTU_HEADER_DIR}>)
target_compile_features(mrtu_platform INTERFACE cxx_std_20)
add_library(mrtu_framework STATIC $<TARGET_OBJECTS:framework>)
set_target_properties(mrtu_framework PROPERTIES EXPORT_NAME framework LINKER_LANGUAGE CXX)
target_link_libraries(mrtu_framework PUBLIC mrtu_platform)

install(TARGETS mrtu_platform mrtu_framework EXPORT mrtu
  ARCHIVE COMPONENT development DESTINATION ${MRTU_PLUGIN_DIR})
install(EXPORT mrtu NAMESPACE mrtu:: FILE mrtu-targets.cmake
  COMPONENT development DESTINATION ${MRTU_CMAKE_DIR})
install(DIRECTORY platform framework COMPONENT development DESTINATION ${MRTU_HEADER_DIR}
  FILES_MATCHING PATTERN "*.h")

set(package_folder "${CMAKE_CURRENT_BINARY_DIR}/package")
configure_package_config_file(cmake/package/mrtu-config.cmake.in
  "${package_folder}/mrtu-config.cmake" INSTALL_DESTINATION ${MRTU_CMAKE_DIR})
write_basic_package_version_file("${package_folder}/mrtu-config-version.cmake"
  COMPATIBILITY SameMajorVersion)
configure_file(cmake/package/mrtu.pc.in "${package_folder}/mrtu.pc" @ONLY)
install(FILES "${package_folder}/mrtu-config.cmake" "${package_folder}/mrtu-config-version.cmake"
  COMPONENT development DESTINATION ${MRTU_CMAKE_DIR})
install(FILES "${package_folder}/mrtu.pc" COMPONENT development DESTINATION lib/pkgconfig)

# cpack in the build folder makes a .deb for this machine's architecture.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME mrtu)
set(CPACK_PACKAGE_CONTACT "mrtu <mrtu@localhost>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "${PROJECT_DESCRIPTION}")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_PACKAGE_DIRECTORY "${CMAKE_CURRENT_BINARY_DIR}/packages")
set(CPACK_STRIP_FILES ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION utils)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS "${CMAKE_LIBRARY_OUTPUT_DIRECTORY}")
set(CPACK_COMPONENTS_ALL runtime development)
set(CPACK_COMPONENTS_GROUPING ALL_COMPONENTS_IN_ONE)
include(CPack)
