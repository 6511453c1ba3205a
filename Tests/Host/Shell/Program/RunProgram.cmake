cmake_minimum_required(VERSION 3.25)

# Runs the program once and checks what it did (ctest drives it; see Tests/CMakeLists.txt).
#   -DPROGRAM=path            the effectcontrols executable
#   -DARGS=a;b;c              its arguments ("<out>" stands for the output folder)
#   -DOUT=dir                 output folder, emptied first
#   -DEXPECT_EXIT=n           the exit code it must return
#   -DEXPECT_STDERR=regex     (optional) what its error output must match
#   -DEXPECT_FILES=a;b        (optional) files it must have written under OUT
#   -DEXPECT_NO_OUTPUT=1      (optional) it must have written nothing under OUT
file(REMOVE_RECURSE "${OUT}")
file(MAKE_DIRECTORY "${OUT}")
string(REPLACE "<out>" "${OUT}" args "${ARGS}")
# In the output folder: anything the program writes where it runs stays with the test.
execute_process(COMMAND "${PROGRAM}" ${args} WORKING_DIRECTORY "${OUT}"
                RESULT_VARIABLE exit_code OUTPUT_VARIABLE out ERROR_VARIABLE err)
message(STATUS "exit ${exit_code}\nstdout:\n${out}\nstderr:\n${err}")
if(NOT exit_code STREQUAL EXPECT_EXIT)
  message(FATAL_ERROR "expected exit code ${EXPECT_EXIT}, got ${exit_code}")
endif()
if(DEFINED EXPECT_STDERR AND NOT err MATCHES "${EXPECT_STDERR}")
  message(FATAL_ERROR "stderr does not match '${EXPECT_STDERR}'")
endif()
if(EXPECT_NO_OUTPUT)
  file(GLOB_RECURSE written "${OUT}/*")
  if(written)
    message(FATAL_ERROR "expected no output, found: ${written}")
  endif()
endif()
foreach(name IN LISTS EXPECT_FILES)
  if(NOT EXISTS "${OUT}/${name}")
    message(FATAL_ERROR "missing output ${OUT}/${name}")
  endif()
endforeach()
