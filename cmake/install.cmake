# Installs the library, its headers and, when it is built, the embedded host and the program, with
# a package that find_package(fileio) finds.
include(CMakePackageConfigHelpers)

install(TARGETS fileio fileio_library EXPORT fileioTargets)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/fileio DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}
    FILES_MATCHING PATTERN *.h)
if(FILEIO_HOST STREQUAL "embedded")
  install(TARGETS fileio_embedded EXPORT fileioTargets)
  if(FILEIO_BUILD_PROGRAM)
    install(TARGETS fileio_program)
  endif()
  install(DIRECTORY ${PROJECT_SOURCE_DIR}/embedded/services
      DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/embedded FILES_MATCHING PATTERN *.h)
endif()

set(package ${CMAKE_INSTALL_LIBDIR}/cmake/fileio)
install(EXPORT fileioTargets NAMESPACE fileio:: DESTINATION ${package})
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/fileioConfig.cmake.in
    ${PROJECT_BINARY_DIR}/fileioConfig.cmake INSTALL_DESTINATION ${package})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/fileioConfigVersion.cmake
    COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/fileioConfig.cmake
    ${PROJECT_BINARY_DIR}/fileioConfigVersion.cmake DESTINATION ${package})
