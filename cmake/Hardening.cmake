# What is optimized is hardened, whoever builds it: position-independent programs, read-only relocations,
# guarded stacks, checked calls of the C library, and marked targets of indirect jumps where the processor
# knows them. tests/package/hardening.sh looks at the result.

# complete_library(<target>): every symbol that the library takes from others is found when it is linked,
# but for those of a sanitizer, which lie in the program.
function(complete_library target)
  if(NOT LIBSCHEMA_SANITIZE AND NOT LIBSCHEMA_FUZZ)
    target_link_options(${target} PRIVATE LINKER:-z,defs)
  endif()
endfunction()

set(LIBSCHEMA_HARDENED OFF)
if(CMAKE_BUILD_TYPE MATCHES "^(Release|RelWithDebInfo|MinSizeRel)$"
   AND NOT LIBSCHEMA_SANITIZE AND NOT LIBSCHEMA_COVERAGE AND NOT LIBSCHEMA_FUZZ)
  set(LIBSCHEMA_HARDENED ON)
  include(CheckPIESupported)
  check_pie_supported()
  set(CMAKE_POSITION_INDEPENDENT_CODE ON)
  target_compile_options(schema_options INTERFACE
      -U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2 -fstack-protector-strong -fstack-clash-protection)
  if(CMAKE_SYSTEM_PROCESSOR MATCHES "^(x86_64|AMD64|amd64|i[3-6]86)$")
    target_compile_options(schema_options INTERFACE -fcf-protection)
  endif()
  add_link_options(LINKER:-z,relro LINKER:-z,now)
endif()
