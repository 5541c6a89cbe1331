# Compiles the files of each folder of a target at once: most of the time goes into the headers that they share. Not where
# each file has to show that it includes what it uses.
function(compile_folders_at_once target)
  if(CMAKE_DISABLE_PRECOMPILE_HEADERS)
    return()
  endif()
  get_target_property(sources ${target} SOURCES)
  foreach(source ${sources})
    cmake_path(GET source PARENT_PATH folder)
    string(MAKE_C_IDENTIFIER "folder_${folder}" group)
    set_source_files_properties(${source} PROPERTIES UNITY_GROUP ${group})
  endforeach()
  set_target_properties(${target} PROPERTIES UNITY_BUILD ON UNITY_BUILD_MODE GROUP)
endfunction()
