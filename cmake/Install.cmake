# `cmake --install` puts under the prefix what a host needs: the expert library, the public
# header, the corbel program with its manual page and bash completion, a CMake package (find_package(qv1588) gives the imported
# targets qv1588::qv1588, the library with the header, and qv1588::host_api, the header
# alone for hosts that load the library with dlopen) and a pkg-config file qv1588.pc.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

if(NOT TARGET qv1588)
  return()
endif()

set(QV_CMAKE_PACKAGE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/qv1588)
# Installed programs and libraries carry no debug information, also with a plain
# `cmake --install` (the build tree keeps it): the same as `cmake --install --strip`.
install(CODE "set(CMAKE_INSTALL_DO_STRIP TRUE)")
# Installed, the header is found under the prefix instead of the source tree.
set_target_properties(qv_host_api PROPERTIES
  EXPORT_NAME host_api
  INTERFACE_INCLUDE_DIRECTORIES
    "$<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/expert/include>;$<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>")
target_link_libraries(qv1588 INTERFACE qv_host_api)
install(TARGETS qv1588 qv_host_api EXPORT qv1588Targets
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/expert/include/qv1588
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(TARGETS corbel RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
# corbel's manual page and its bash completion (loaded by bash-completion on demand).
install(FILES ${PROJECT_SOURCE_DIR}/corbel/cli/corbel.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1)
install(FILES ${PROJECT_SOURCE_DIR}/corbel/cli/corbel.bash-completion
        DESTINATION ${CMAKE_INSTALL_DATAROOTDIR}/bash-completion/completions RENAME corbel)
# corbel serve as a systemd service; systemd finds units under <prefix>/lib/systemd/system
# for the prefixes /usr and /usr/local.
if(TARGET corbel_serve)
  configure_file(${PROJECT_SOURCE_DIR}/corbel/serve/corbel-serve.service.in
                 ${CMAKE_CURRENT_BINARY_DIR}/corbel-serve.service @ONLY)
  install(FILES ${CMAKE_CURRENT_BINARY_DIR}/corbel-serve.service DESTINATION lib/systemd/system)
endif()
install(EXPORT qv1588Targets NAMESPACE qv1588:: DESTINATION ${QV_CMAKE_PACKAGE_DIR})

file(WRITE ${CMAKE_CURRENT_BINARY_DIR}/qv1588Config.cmake
     "include(\"\${CMAKE_CURRENT_LIST_DIR}/qv1588Targets.cmake\")\n")
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/qv1588ConfigVersion.cmake
                                 COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/qv1588Config.cmake
              ${CMAKE_CURRENT_BINARY_DIR}/qv1588ConfigVersion.cmake
        DESTINATION ${QV_CMAKE_PACKAGE_DIR})

# The prefix is found from the .pc file's own folder, so that `cmake --install --prefix`
# anywhere gives a working file.
file(RELATIVE_PATH QV_PC_TO_PREFIX /prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig /prefix)
string(REGEX REPLACE "/$" "" QV_PC_TO_PREFIX "${QV_PC_TO_PREFIX}")
configure_file(${PROJECT_SOURCE_DIR}/cmake/qv1588.pc.in ${CMAKE_CURRENT_BINARY_DIR}/qv1588.pc
               @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/qv1588.pc
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
