# find_server_platform(<folder>): a server's own platform, given by LIBSCHEMA_PLATFORM. Its headers
# ldtr.h, timestamp.h, CSymbolTable.h and Clex_analyzer.h lie in the folder itself or in include/, trace/,
# time/ or parse/ of it, its libraries in the folder or in lib/ of it: each of them, a shared one before an
# archive of the same name. Sets server_platform_includes, server_platform_libraries and
# server_platform_folders, those of the shared ones.

function(find_server_platform folder)
  set(includes "")
  foreach(header IN ITEMS ldtr.h timestamp.h CSymbolTable.h Clex_analyzer.h)
    find_path(place ${header} PATHS ${folder} PATH_SUFFIXES include trace time parse
              NO_DEFAULT_PATH NO_CACHE)
    if(NOT place)
      message(FATAL_ERROR "LIBSCHEMA_PLATFORM: no ${header} in ${folder}, nor in its include folder")
    endif()
    cmake_path(SET place NORMALIZE ${place})
    string(REGEX REPLACE "/$" "" place ${place})
    list(APPEND includes ${place})
    unset(place)
  endforeach()
  list(REMOVE_DUPLICATES includes)

  file(GLOB libraries ${folder}/lib*.so ${folder}/lib/lib*.so)
  set(folders "")
  foreach(library IN LISTS libraries)
    cmake_path(GET library PARENT_PATH place)
    list(APPEND folders ${place})
  endforeach()
  list(REMOVE_DUPLICATES folders)
  file(GLOB archives ${folder}/lib*.a ${folder}/lib/lib*.a)
  foreach(archive IN LISTS archives)
    string(REGEX REPLACE "\\.a$" ".so" shared ${archive})
    if(NOT shared IN_LIST libraries)
      list(APPEND libraries ${archive})
    endif()
  endforeach()
  if(NOT libraries)
    message(FATAL_ERROR "LIBSCHEMA_PLATFORM: no library in ${folder}, nor in its lib folder")
  endif()
  set(server_platform_includes ${includes} PARENT_SCOPE)
  set(server_platform_libraries ${libraries} PARENT_SCOPE)
  set(server_platform_folders ${folders} PARENT_SCOPE)
endfunction()
