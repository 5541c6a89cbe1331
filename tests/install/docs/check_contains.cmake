# Fails unless the file WHOLE contains the file PART, letter for letter.
file(READ ${WHOLE} whole)
file(READ ${PART} part)
string(FIND "${whole}" "${part}" position)
if(position EQUAL -1)
  message(FATAL_ERROR "${WHOLE} does not contain ${PART}")
endif()
