# cmake -DNM=... -DLIBRARY=... -DEXPECTED=A;B -P CheckExports.cmake
# Fails unless the defined dynamic symbols of LIBRARY are those of EXPECTED and no others.
# Constructors and destructors, which the compiler emits twice, count once.
execute_process(COMMAND ${NM} --dynamic --demangle --defined-only ${LIBRARY}
  OUTPUT_VARIABLE listing RESULT_VARIABLE failed)
if(failed)
  message(FATAL_ERROR "cannot read the symbols of ${LIBRARY}")
endif()
string(REGEX MATCHALL "[^\n]+" lines "${listing}")
set(found)
foreach(line IN LISTS lines)
  string(REGEX REPLACE "^[0-9a-f]+ . " "" symbol "${line}")
  string(REGEX REPLACE "\\[abi:cxx11\\]" "" symbol "${symbol}")
  string(REGEX REPLACE "\\(.*$" "" symbol "${symbol}")
  list(APPEND found "${symbol}")
endforeach()
list(REMOVE_DUPLICATES found)
list(SORT found)
set(expected ${EXPECTED})
list(SORT expected)
if(NOT found STREQUAL expected)
  message(FATAL_ERROR "${LIBRARY} exports\n  ${found}\nand not\n  ${expected}")
endif()
