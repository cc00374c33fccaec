# Compiles a source that includes HEADER with the include paths of a layer
# (INCLUDES, separated by "|") and checks the outcome EXPECT: "builds", or
# "refused" when the header must not be found from that layer.
file(MAKE_DIRECTORY ${WORK})
set(source ${WORK}/Uses.cpp)
file(WRITE ${source} "#include \"${HEADER}\"\n")
string(REPLACE "|" ";" dirs "${INCLUDES}")
set(flags)
foreach(dir IN LISTS dirs)
  list(APPEND flags -I${dir})
endforeach()
execute_process(COMMAND ${COMPILER} -std=c++20 -fsyntax-only ${flags} ${source}
                RESULT_VARIABLE result OUTPUT_VARIABLE output ERROR_VARIABLE output)
if(EXPECT STREQUAL "builds" AND NOT result EQUAL 0)
  message(FATAL_ERROR "${HEADER} should compile here:\n${output}")
endif()
if(EXPECT STREQUAL "refused")
  if(result EQUAL 0)
    message(FATAL_ERROR "${HEADER} compiled from a layer that must not use it")
  endif()
  if(NOT output MATCHES "${HEADER}: No such file")
    message(FATAL_ERROR "${HEADER} failed for another reason than its layer:\n${output}")
  endif()
endif()
