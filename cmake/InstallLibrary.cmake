# install_library(<header>...): the headers in one flat folder, the shared and the static library with
# the platform behind them, and the files by which CMake and pkg-config find them. The installed tree
# can be moved as a whole. A server's own platform is not installed, but referred to. The components are
# runtime, development, tool and documentation.

include(CMakePackageConfigHelpers)

# Sets `result` to `path` as libschema.pc gives it: below ${prefix}, unless it is absolute.
function(pkg_config_path path result)
  if(IS_ABSOLUTE "${path}")
    set(${result} "${path}" PARENT_SCOPE)
  else()
    set(${result} "\${prefix}/${path}" PARENT_SCOPE)
  endif()
endfunction()

# Sets pc_prefix, pc_libdir and pc_includedir, and installs the file that `template` becomes with
# them.
function(install_pkg_config template)
  file(RELATIVE_PATH pc_prefix "${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig" "${CMAKE_INSTALL_PREFIX}")
  string(REGEX REPLACE "/$" "" pc_prefix "${pc_prefix}")
  pkg_config_path("${CMAKE_INSTALL_LIBDIR}" pc_libdir)
  pkg_config_path("${CMAKE_INSTALL_INCLUDEDIR}" pc_includedir)
  get_filename_component(name ${template} NAME_WLE)
  configure_file(${PROJECT_SOURCE_DIR}/cmake/${template} ${PROJECT_BINARY_DIR}/package/${name} @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/package/${name} DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig
          COMPONENT development)
endfunction()

# install_migration_library(<header>...): the same for the library behind it, in the package of
# libschema.
function(install_migration_library)
  install(FILES ${ARGN} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/libschema-migration
          COMPONENT development)
  install(TARGETS migration migration_static EXPORT libschemaTargets
          LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime
                  NAMELINK_COMPONENT development
          ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT development)
  install_pkg_config(libschema-migration.pc.in)
endfunction()

function(install_library)
  set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/libschema)

  install(FILES ${ARGN} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/libschema
          COMPONENT development)
  set(targets schema schema_static)
  set(pc_stand_ins "-lschema-platform")
  set(pc_platform "")
  set(pc_platform_includes "")
  if(LIBSCHEMA_PLATFORM)
    set(pc_stand_ins "")
    list(TRANSFORM server_platform_libraries PREPEND " " OUTPUT_VARIABLE pc_platform)
    list(JOIN pc_platform "" pc_platform)
    list(TRANSFORM server_platform_includes PREPEND " -I" OUTPUT_VARIABLE pc_platform_includes)
    list(JOIN pc_platform_includes "" pc_platform_includes)
  else()
    list(APPEND targets schema_platform schema_platform_static)
  endif()
  install(TARGETS ${targets} EXPORT libschemaTargets
          LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime
                  NAMELINK_COMPONENT development
          ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT development)

  install(EXPORT libschemaTargets NAMESPACE libschema:: DESTINATION ${package_dir}
          COMPONENT development)
  configure_package_config_file(
      ${PROJECT_SOURCE_DIR}/cmake/libschemaConfig.cmake.in
      ${PROJECT_BINARY_DIR}/package/libschemaConfig.cmake
      INSTALL_DESTINATION ${package_dir})
  write_basic_package_version_file(
      ${PROJECT_BINARY_DIR}/package/libschemaConfigVersion.cmake
      COMPATIBILITY SameMajorVersion)
  install(FILES ${PROJECT_BINARY_DIR}/package/libschemaConfig.cmake
                ${PROJECT_BINARY_DIR}/package/libschemaConfigVersion.cmake
          DESTINATION ${package_dir} COMPONENT development)

  install_pkg_config(libschema.pc.in)
endfunction()
