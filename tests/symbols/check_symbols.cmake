# Holds the symbols of the shared library against two lists: what it exports must be exactly the
# names in EXPORTED, what it takes from elsewhere must be among those in UNDEFINED.
#
#   cmake -DNM=nm -DLIBRARY=libhaze_preview.so -DEXPORTED=... -DUNDEFINED=... -P check_symbols.cmake

# Demangled names of the dynamic symbols, without version suffix.
function(list_symbols kind result)
  execute_process(COMMAND ${NM} -DC --${kind} --format=posix ${LIBRARY}
    OUTPUT_VARIABLE output COMMAND_ERROR_IS_FATAL ANY)
  string(REPLACE ";" "," output "${output}")
  string(STRIP "${output}" output)
  string(REPLACE "\n" ";" lines "${output}")
  set(names "")
  foreach(line IN LISTS lines)
    # name, type letter, then address and size where there are any
    string(REGEX REPLACE " [A-Za-z]( +[0-9a-f]+)*( +)?$" "" name "${line}")
    string(REGEX REPLACE "@+[A-Za-z0-9_.]+$" "" name "${name}")
    list(APPEND names "${name}")
  endforeach()
  list(SORT names)
  set(${result} "${names}" PARENT_SCOPE)
endfunction()

function(report title names)
  if(names)
    list(JOIN names "\n  " text)
    message(SEND_ERROR "${title}:\n  ${text}")
  endif()
endfunction()

file(STRINGS ${EXPORTED} allowed_exports)
file(STRINGS ${UNDEFINED} allowed_undefined)

list_symbols(defined-only exports)
set(missing ${allowed_exports})
list(REMOVE_ITEM missing ${exports})
set(extra ${exports})
list(REMOVE_ITEM extra ${allowed_exports})
report("exported by the list but not by the library" "${missing}")
report("exported by the library but not by the list" "${extra}")

list_symbols(undefined-only undefined)
list(REMOVE_ITEM undefined ${allowed_undefined})
report("taken from a library that it must not need" "${undefined}")

list(LENGTH exports count)
message(STATUS "${count} exported symbols")
