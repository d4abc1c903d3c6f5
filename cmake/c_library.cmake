# libtalutil.so: the core for C and whatever can call C. Its typed functions are generated from the interface table.
include(GNUInstallDirs)

add_executable(write_c_interface tools/write_c_interface.cpp src/texts/member_texts.cpp ${member_texts})
target_link_libraries(write_c_interface PRIVATE talutil_options)
foreach(layer library controls documents archives platform texts automation)
  target_include_directories(write_c_interface PRIVATE ${CMAKE_BINARY_DIR}/layers/${layer})
endforeach()
set(c_interface ${CMAKE_BINARY_DIR}/generated)
file(MAKE_DIRECTORY ${c_interface})
add_custom_command(
  OUTPUT ${c_interface}/talutil_members.h ${c_interface}/talutil_members.cpp
  COMMAND write_c_interface header > ${c_interface}/talutil_members.h
  COMMAND write_c_interface source > ${c_interface}/talutil_members.cpp
  DEPENDS write_c_interface
  COMMENT "Writing the typed functions of the C library")

talutil_layer(capi BELOW calling posix FAST ALL)
target_include_directories(layer_capi PRIVATE ${c_interface} src/capi)
target_sources(layer_capi PRIVATE ${c_interface}/talutil_members.cpp ${c_interface}/talutil_members.h)
add_library(talutil_c SHARED)
set_target_properties(talutil_c PROPERTIES OUTPUT_NAME talutil EXPORT_NAME talutil VERSION ${PROJECT_VERSION}
  SOVERSION ${PROJECT_VERSION_MAJOR} LINK_DEPENDS ${CMAKE_SOURCE_DIR}/src/capi/talutil_c.map)
target_link_libraries(talutil_c PRIVATE layer_capi talutil_platform)
target_link_options(talutil_c PRIVATE -Wl,--version-script=${CMAKE_SOURCE_DIR}/src/capi/talutil_c.map
  -Wl,--gc-sections -Wl,-z,defs)
target_include_directories(talutil_c INTERFACE
  $<BUILD_INTERFACE:${CMAKE_SOURCE_DIR}/src/capi> $<BUILD_INTERFACE:${c_interface}>
  $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)

# The package for find_package(TALUtil) and the description for pkg-config.
include(CMakePackageConfigHelpers)
set(package_folder ${CMAKE_INSTALL_LIBDIR}/cmake/TALUtil)
install(TARGETS talutil_c EXPORT TALUtil LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR})
install(FILES src/capi/talutil_c.h ${c_interface}/talutil_members.h DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(EXPORT TALUtil NAMESPACE TALUtil:: FILE TALUtilConfig.cmake DESTINATION ${package_folder})
write_basic_package_version_file(${CMAKE_BINARY_DIR}/TALUtilConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_BINARY_DIR}/TALUtilConfigVersion.cmake DESTINATION ${package_folder})
file(RELATIVE_PATH prefix_from_description /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(cmake/talutil.pc.in talutil.pc @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/talutil.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
