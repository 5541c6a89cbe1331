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
