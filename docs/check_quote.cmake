# Fails unless PAGE quotes the part of EXAMPLE between its two markers, line by line.
file(READ ${EXAMPLE} example)
file(READ ${PAGE} page)
string(REGEX MATCH "// \\[pipeline\\]\n(.*)// \\[pipeline\\]" whole "${example}")
string(FIND "${page}" "${CMAKE_MATCH_1}" position)
if(position EQUAL -1)
  message(FATAL_ERROR "${PAGE} does not quote the pipeline of ${EXAMPLE}")
endif()
