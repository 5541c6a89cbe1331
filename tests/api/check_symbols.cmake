# Checks the dynamic symbols of LIBRARY. Any difference is fatal.

# The dynamic symbols that `nm` lists with these options, sorted: names, with their version if they have one.
function(read_symbols result)
  execute_process(
    COMMAND ${NM} --dynamic ${ARGN} ${LIBRARY}
    OUTPUT_VARIABLE lines
    OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
  string(REGEX MATCHALL "[^\n]+" lines "${lines}")
  set(names)
  foreach(line IN LISTS lines)
    # A weak reference may stay unresolved, so nothing is needed from anywhere for it.
    if(line MATCHES "^[0-9a-f ]*([A-Za-z]) ([^ ]+)$" AND NOT CMAKE_MATCH_1 STREQUAL "w")
      list(APPEND names ${CMAKE_MATCH_2})
    endif()
  endforeach()
  list(SORT names)
  set(${result} ${names} PARENT_SCOPE)
endfunction()

function(require_equal what actual expected)
  if(NOT actual STREQUAL expected)
    message(FATAL_ERROR "${what}: ${actual}\nexpected: ${expected}")
  endif()
endfunction()

if(CHECK STREQUAL "exports")
  read_symbols(exports --defined-only)

  file(READ ${HEADER} header)
  string(REGEX MATCHALL "\nSENSELOOM_API [^;]+" declarations "${header}")
  set(declared)
  foreach(declaration IN LISTS declarations)
    string(REGEX MATCH "([A-Za-z0-9_]+) *(\\(.*)?$" match "${declaration}")
    list(APPEND declared ${CMAKE_MATCH_1})
  endforeach()
  list(SORT declared)

  file(READ ${VERSION_SCRIPT} script)
  string(REGEX MATCH "global:([^:]*)local:[ \n]*\\*;" match "${script}")
  string(REGEX MATCHALL "[A-Za-z0-9_]+" versioned "${CMAKE_MATCH_1}")
  list(SORT versioned)

  require_equal("exported by the library" "${exports}" "${declared}")
  require_equal("named in the version script" "${versioned}" "${declared}")
  require_equal("declared" "${declared}"
                "_va_del;_va_init;audio_hal_activate;audio_hal_deactivate;audio_hal_init;ctx_close_session;\
ctx_dispatch_data;ctx_open_session;ctx_option_release;ctx_set_option;ctx_uninit;device;gIsActivated;getSensor;va_free;\
va_new")
else()
  read_symbols(imports --undefined-only)
  # What the C library, the C++ library and the compiler's own one bring has a version of theirs.
  list(FILTER imports EXCLUDE REGEX "@(GLIBC|GLIBCXX|CXXABI|GCC)_")
  list(TRANSFORM imports REPLACE "@.*" "")
  require_equal("imported" "${imports}"
                "__android_log_print;gesture_close;gesture_initial;gesture_process_single_data;hw_get_module_by_class;\
json_delete;json_get_alloc_funcs;json_integer_value;json_loads;json_object_get;json_string_value")
endif()
