# The component documentation: what there is to read, the example, and with LIBSCHEMA_REFERENCE the reference
# of the installed headers, made by Doxygen.

option(LIBSCHEMA_REFERENCE "Make the reference of both libraries (Doxygen)" OFF)

install(FILES README.md DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation
        FILES_MATCHING PATTERN "*.md" PATTERN "*.schema.json" PATTERN "reference" EXCLUDE PATTERN "man" EXCLUDE)
install(DIRECTORY examples DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)

# configure_reference(<folder> <variable>): the variable names a settings file by which Doxygen makes the
# reference in the folder. Any warning makes it fail.
function(configure_reference reference_folder variable)
  file(MAKE_DIRECTORY ${reference_folder})
  configure_file(${PROJECT_SOURCE_DIR}/docs/reference/Doxyfile.in ${reference_folder}/Doxyfile @ONLY)
  set(${variable} ${reference_folder}/Doxyfile PARENT_SCOPE)
endfunction()

if(LIBSCHEMA_REFERENCE)
  find_program(DOXYGEN doxygen REQUIRED)
  configure_reference(${PROJECT_BINARY_DIR}/reference settings)
  file(GLOB inputs CONFIGURE_DEPENDS ${PROJECT_BINARY_DIR}/include/*/*.h
       ${PROJECT_SOURCE_DIR}/docs/reference/*.md)
  add_custom_command(OUTPUT ${PROJECT_BINARY_DIR}/reference/html/index.html
                     COMMAND ${CMAKE_COMMAND} -E env LC_ALL=C.UTF-8 ${DOXYGEN} ${settings}
                     DEPENDS ${settings} ${inputs} ${PROJECT_SOURCE_DIR}/docs/reference/comments.awk
                     COMMENT "Making the reference" VERBATIM)
  add_custom_target(reference ALL DEPENDS ${PROJECT_BINARY_DIR}/reference/html/index.html)
  install(DIRECTORY ${PROJECT_BINARY_DIR}/reference/html DESTINATION ${CMAKE_INSTALL_DOCDIR}
          COMPONENT documentation)
endif()
