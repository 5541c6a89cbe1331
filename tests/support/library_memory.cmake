# Has the linker send each reference to a function F to __wrap_F, and to F those to __real_F.
function(wrap_functions name)
  foreach(function ${ARGN})
    target_link_options(${name} PRIVATE LINKER:--wrap=${function})
  endforeach()
endfunction()

# Has a test program watch the memory of the library and let its allocations fail, through library_memory.h.
function(senseloom_watch_memory name)
  set(folder ${CMAKE_CURRENT_FUNCTION_LIST_DIR})
  target_sources(${name} PRIVATE ${folder}/library_memory.cpp)
  target_include_directories(${name} PRIVATE ${folder})
  wrap_functions(
    ${name}
    malloc
    calloc
    realloc
    free
    ctx_open_session
    ctx_set_option
    ctx_dispatch_data
    ctx_close_session
    ctx_option_release
    ctx_uninit
    audio_hal_init
    audio_hal_activate
    audio_hal_deactivate
    _va_init
    va_new
    _va_del
    va_free)
endfunction()
