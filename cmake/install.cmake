# SPDX-License-Identifier: MIT
# The installed package: shared library, archive with the classes, headers, how CMake and pkg-config find them, pages and
# examples, and what Python's and Octave's own installers take.
include(CMakePackageConfigHelpers)

set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/vardel_ip_quarzel)
install(TARGETS vardel_ip_quarzel vardel_ip_quarzel_static EXPORT vardel_ip_quarzel)
install(FILES ${PROJECT_SOURCE_DIR}/include/vardel_ip_quarzel.h TYPE INCLUDE)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/quarzel TYPE INCLUDE)
foreach(folder fixed interleaver engine decoder)
  install(DIRECTORY ${PROJECT_SOURCE_DIR}/src/${folder} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/quarzel
          FILES_MATCHING PATTERN "*.hpp")
endforeach()
install(EXPORT vardel_ip_quarzel NAMESPACE vardel_ip_quarzel:: DESTINATION ${package_dir}
        FILE vardel_ip_quarzel-targets.cmake)

configure_package_config_file(cmake/vardel_ip_quarzel-config.cmake.in
  ${CMAKE_CURRENT_BINARY_DIR}/vardel_ip_quarzel-config.cmake INSTALL_DESTINATION ${package_dir})
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/vardel_ip_quarzel-config-version.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/vardel_ip_quarzel-config.cmake
              ${CMAKE_CURRENT_BINARY_DIR}/vardel_ip_quarzel-config-version.cmake
        DESTINATION ${package_dir})

# Paths in the .pc file are relative to the file, so that an installed tree may be moved.
file(RELATIVE_PATH QUARZEL_PC_PREFIX /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(cmake/vardel_ip_quarzel.pc.in vardel_ip_quarzel.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/vardel_ip_quarzel.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)

set(doc_dir ${CMAKE_INSTALL_DATADIR}/doc/quarzel)
install(FILES README.md CHANGELOG.md LICENSE DESTINATION ${doc_dir})
install(DIRECTORY docs examples DESTINATION ${doc_dir} PATTERN docs/site EXCLUDE)
if(TARGET quarzel_wheel)
  install(DIRECTORY ${PROJECT_BINARY_DIR}/bindings/python/dist/ DESTINATION ${CMAKE_INSTALL_DATADIR}/quarzel/python
          FILES_MATCHING PATTERN "quarzel-${PROJECT_VERSION}-*.whl")
endif()
if(TARGET quarzel_octave_package)
  install(FILES ${PROJECT_BINARY_DIR}/bindings/octave/quarzel-octave-${PROJECT_VERSION}.tar.gz
          DESTINATION ${CMAKE_INSTALL_DATADIR}/quarzel/octave)
endif()
