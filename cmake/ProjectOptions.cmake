# Compiler settings shared by every target of the project.
add_library(ec_options INTERFACE)
target_compile_options(ec_options INTERFACE
  -Wall -Wextra -Wpedantic -Werror
  -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual -Wcast-align
  -Wimplicit-fallthrough -Wmissing-declarations)
target_include_directories(ec_options INTERFACE ${PROJECT_SOURCE_DIR})
# Diagnostics, assertions and debug information name sources relative to the repository, so they
# read the same on every machine and in every checkout.
target_compile_options(ec_options INTERFACE -ffile-prefix-map=${PROJECT_SOURCE_DIR}/=)
# GCC 12 reports -Wrestrict inside libstdc++'s string concatenation when optimising ("'" +
# std::string(x) + "'"), a known false positive fixed in GCC 13; it would fail every release build.
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  target_compile_options(ec_options INTERFACE -Wno-restrict)
endif()

if(EC_FUZZ)
  # Coverage for libFuzzer in every library a harness reaches; only the harnesses link its main.
  target_compile_options(ec_options INTERFACE -fsanitize=fuzzer-no-link)
endif()

if(EC_SANITIZE)
  set(ec_sanitize_flags -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_compile_options(ec_options INTERFACE ${ec_sanitize_flags})
  target_link_options(ec_options INTERFACE ${ec_sanitize_flags})
endif()

# ec_add_library(NAME DIR [DEPS...]): one library per folder, made of every .cpp in it.
# Globbing keeps parallel work on one folder free of edits to a shared source list.
function(ec_add_library name dir)
  file(GLOB sources CONFIGURE_DEPENDS ${dir}/*.cpp)
  file(GLOB headers CONFIGURE_DEPENDS ${dir}/*.h)
  if(sources)
    add_library(${name} STATIC ${sources} ${headers})
    target_link_libraries(${name} PUBLIC ec_options ${ARGN})
  else()
    add_library(${name} INTERFACE)
    target_link_libraries(${name} INTERFACE ec_options ${ARGN})
  endif()
endfunction()

# ec_add_test(NAME DIR [DEPS...]): one GoogleTest program made of every .cpp in DIR.
function(ec_add_test name dir)
  file(GLOB sources CONFIGURE_DEPENDS ${dir}/*.cpp)
  if(NOT sources)
    return()
  endif()
  add_executable(${name} ${sources})
  target_link_libraries(${name} PRIVATE ec_options GTest::gtest GTest::gmock GTest::gtest_main ${ARGN})
  gtest_discover_tests(${name} TEST_PREFIX "${name}." WORKING_DIRECTORY ${PROJECT_SOURCE_DIR} DISCOVERY_TIMEOUT 60)
endfunction()
