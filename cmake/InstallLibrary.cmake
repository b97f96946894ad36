# install_library(<header>...): the headers in one flat folder, the shared and the static library, and
# the files by which CMake and pkg-config find them. The installed tree can be moved as a whole.

include(CMakePackageConfigHelpers)

# Sets `result` to `path` as libschema.pc gives it: below ${prefix}, unless it is absolute.
function(pkg_config_path path result)
  if(IS_ABSOLUTE "${path}")
    set(${result} "${path}" PARENT_SCOPE)
  else()
    set(${result} "\${prefix}/${path}" PARENT_SCOPE)
  endif()
endfunction()

function(install_library)
  set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/libschema)
  set(pkg_config_dir ${CMAKE_INSTALL_LIBDIR}/pkgconfig)

  install(FILES ${ARGN} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/libschema)
  install(TARGETS schema schema_static EXPORT libschemaTargets
          LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
          ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR})

  install(EXPORT libschemaTargets NAMESPACE libschema:: DESTINATION ${package_dir})
  configure_package_config_file(
      ${PROJECT_SOURCE_DIR}/cmake/libschemaConfig.cmake.in
      ${PROJECT_BINARY_DIR}/package/libschemaConfig.cmake
      INSTALL_DESTINATION ${package_dir})
  write_basic_package_version_file(
      ${PROJECT_BINARY_DIR}/package/libschemaConfigVersion.cmake
      COMPATIBILITY SameMajorVersion)
  install(FILES ${PROJECT_BINARY_DIR}/package/libschemaConfig.cmake
                ${PROJECT_BINARY_DIR}/package/libschemaConfigVersion.cmake
          DESTINATION ${package_dir})

  file(RELATIVE_PATH pc_prefix "${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig" "${CMAKE_INSTALL_PREFIX}")
  string(REGEX REPLACE "/$" "" pc_prefix "${pc_prefix}")
  pkg_config_path("${CMAKE_INSTALL_LIBDIR}" pc_libdir)
  pkg_config_path("${CMAKE_INSTALL_INCLUDEDIR}" pc_includedir)
  configure_file(${PROJECT_SOURCE_DIR}/cmake/libschema.pc.in
                 ${PROJECT_BINARY_DIR}/package/libschema.pc @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/package/libschema.pc DESTINATION ${pkg_config_dir})
endfunction()
