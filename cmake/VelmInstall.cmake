# Installation: the libraries, their public headers, a pkg-config file and a CMake
# package so that a shell can use find_package(velm).
include(CMakePackageConfigHelpers)

set(velm_install_targets velm)
foreach(t velmbase velmsignal)
  if(TARGET ${t})
    list(APPEND velm_install_targets ${t})
  endif()
endforeach()

install(TARGETS ${velm_install_targets} EXPORT velmTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR}
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/velm)

# Public headers keep the folder they live in, so includes read the same inside and outside.
file(GLOB_RECURSE velm_public_headers RELATIVE ${PROJECT_SOURCE_DIR}
  ${PROJECT_SOURCE_DIR}/outside/*.h ${PROJECT_SOURCE_DIR}/core/*.h ${PROJECT_SOURCE_DIR}/edit/*.h
  ${PROJECT_SOURCE_DIR}/render/*.h ${PROJECT_SOURCE_DIR}/control/*.h ${PROJECT_SOURCE_DIR}/sound/*.h
  ${PROJECT_SOURCE_DIR}/widgets/*.h ${PROJECT_SOURCE_DIR}/persist/*.h ${PROJECT_SOURCE_DIR}/platform/*.h)
list(FILTER velm_public_headers EXCLUDE REGEX "(/internal/|_internal\\.h$|/private/)")
foreach(h ${velm_public_headers})
  get_filename_component(d ${h} DIRECTORY)
  install(FILES ${h} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/velm/${d})
endforeach()

install(EXPORT velmTargets NAMESPACE velm:: DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/velm)
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/velmConfig.cmake.in
  ${CMAKE_CURRENT_BINARY_DIR}/velmConfig.cmake
  INSTALL_DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/velm)
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/velmConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/velmConfig.cmake ${CMAKE_CURRENT_BINARY_DIR}/velmConfigVersion.cmake
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/velm)

configure_file(${PROJECT_SOURCE_DIR}/cmake/velm.pc.in ${CMAKE_CURRENT_BINARY_DIR}/velm.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/velm.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
