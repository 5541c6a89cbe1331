# Has a test program watch what it allocates, through allocations.h.
function(senseloom_watch_allocations name)
  target_sources(${name} PRIVATE ${CMAKE_CURRENT_FUNCTION_LIST_DIR}/allocations.cpp)
  target_include_directories(${name} PRIVATE ${CMAKE_CURRENT_FUNCTION_LIST_DIR})
  target_link_options(${name} PRIVATE -Wl,--wrap=malloc,--wrap=calloc,--wrap=realloc)
endfunction()
