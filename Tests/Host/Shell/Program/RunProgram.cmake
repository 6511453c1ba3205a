cmake_minimum_required(VERSION 3.25)

# Runs the program once and checks what it did (ctest drives it; see Tests/CMakeLists.txt).
#   -DPROGRAM=path            the effectcontrols executable
#   -DARGS=a;b;c              its arguments ("<out>" stands for the output folder)
#   -DOUT=dir                 output folder, emptied first
#   -DEXPECT_EXIT=n           the exit code it must return
#   -DEXPECT_STDERR=regex     (optional) what its error output must match
#   -DEXPECT_FILES=a;b        (optional) files it must have written under OUT
#   -DDUMP=file -DDUMP_CHECKS=json.path=value;...   (optional) values the JSON dump must hold
#   -DEXPECT_NO_OUTPUT=1      (optional) it must have written nothing under OUT
#   -DSAME_AS=dir             (optional) each expected file must be byte-identical to the file of
#                             the same name in dir
file(REMOVE_RECURSE "${OUT}")
file(MAKE_DIRECTORY "${OUT}")
string(REPLACE "<out>" "${OUT}" args "${ARGS}")
execute_process(COMMAND "${PROGRAM}" ${args}
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
  if(DEFINED SAME_AS)
    file(SHA256 "${OUT}/${name}" mine)
    file(SHA256 "${SAME_AS}/${name}" theirs)
    if(NOT mine STREQUAL theirs)
      message(FATAL_ERROR "${OUT}/${name} differs from ${SAME_AS}/${name}")
    endif()
  endif()
endforeach()
if(DEFINED DUMP)
  file(READ "${OUT}/${DUMP}" json)
  foreach(check IN LISTS DUMP_CHECKS)
    string(REGEX MATCH "^([^=]*)=(.*)$" _ "${check}")
    set(path "${CMAKE_MATCH_1}")
    set(expected "${CMAKE_MATCH_2}")
    string(REPLACE "." ";" keys "${path}")
    string(JSON actual ERROR_VARIABLE json_error GET "${json}" ${keys})
    if(json_error)
      message(FATAL_ERROR "dump: ${path}: ${json_error}")
    endif()
    string(REGEX REPLACE "[ \n]" "" actual "${actual}")
    if(NOT actual STREQUAL expected)
      message(FATAL_ERROR "dump: ${path} is '${actual}', expected '${expected}'")
    endif()
  endforeach()
endif()
