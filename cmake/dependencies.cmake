# The libraries that senseloom stands on, as imported targets.

# jansson reads the option strings.
find_path(JANSSON_INCLUDE_DIR jansson.h REQUIRED)
find_library(JANSSON_LIBRARY jansson REQUIRED)
add_library(jansson::jansson UNKNOWN IMPORTED)
set_target_properties(jansson::jansson PROPERTIES IMPORTED_LOCATION ${JANSSON_LIBRARY} INTERFACE_INCLUDE_DIRECTORIES
                                                                                    ${JANSSON_INCLUDE_DIR})

# The Android log: Debian's android-liblog keeps its headers and its library in folders of their own, which the dynamic
# loader does not search either, so what links it gets that folder as a run path.
find_path(ANDROID_LOG_INCLUDE_DIR android/log.h PATH_SUFFIXES android REQUIRED)
find_library(ANDROID_LOG_LIBRARY log PATHS /usr/lib/${CMAKE_LIBRARY_ARCHITECTURE} PATH_SUFFIXES android REQUIRED)
add_library(android::log SHARED IMPORTED)
set_target_properties(android::log PROPERTIES IMPORTED_LOCATION ${ANDROID_LOG_LIBRARY} INTERFACE_INCLUDE_DIRECTORIES
                                                                                     ${ANDROID_LOG_INCLUDE_DIR})
# Its declarations alone, for what brings its own definitions.
add_library(android::log_headers INTERFACE IMPORTED)
target_include_directories(android::log_headers INTERFACE ${ANDROID_LOG_INCLUDE_DIR})

# Recordings are compressed by either. Of zlib in 32 bits Debian's host of 64 bits has what programs need, without the
# name that a linker looks for.
if(NOT ANDROID)
  foreach(library zlib zstd)
    find_path(${library}_INCLUDE_DIR ${library}.h REQUIRED)
  endforeach()
  find_library(zlib_LIBRARY NAMES z libz.so.1 REQUIRED)
  find_library(zstd_LIBRARY zstd REQUIRED)
  foreach(library zlib zstd)
    add_library(${library}::${library} UNKNOWN IMPORTED)
    set_target_properties(${library}::${library} PROPERTIES IMPORTED_LOCATION ${${library}_LIBRARY}
                                                            INTERFACE_INCLUDE_DIRECTORIES ${${library}_INCLUDE_DIR})
  endforeach()
endif()
