# Fails unless LIBRARY exports exactly SYMBOLS, in alphabetical order and separated by commas.
execute_process(
  COMMAND ${NM} --dynamic --defined-only --format=just-symbols ${LIBRARY}
  OUTPUT_VARIABLE exported
  OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
string(REPLACE "\n" "," exported "${exported}")
if(NOT exported STREQUAL SYMBOLS)
  message(FATAL_ERROR "exported: ${exported}\nexpected: ${SYMBOLS}")
endif()
