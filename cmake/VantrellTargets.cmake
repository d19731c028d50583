# One folder is one library, with its files listed by name, and one test program.

# vantrell_quiet_sanitized(SOURCE...)
# With a sanitizer's checks in between, g++ 12 takes parts of std::variant and std::regex in these
# files for uninitialized.
function(vantrell_quiet_sanitized)
  if(VANTRELL_SANITIZE AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    set_source_files_properties(${ARGN} PROPERTIES COMPILE_OPTIONS -Wno-maybe-uninitialized)
  endif()
endfunction()

set(VANTRELL_COMMON_HEADERS <algorithm> <any> <array> <chrono> <cstdint> <expected> <functional>
    <map> <memory> <mutex> <optional> <span> <string> <string_view> <utility> <variant> <vector>)

# vantrell_share_headers(NAME KIND)
# Lets a target reuse the precompiled headers of its KIND, library or test: a precompiled header
# fits only what is compiled with the same options.
function(vantrell_share_headers name kind)
  if(NOT VANTRELL_PRECOMPILE)
    return()
  endif()
  set(owner vantrell_${kind}_headers)
  if(NOT TARGET ${owner})
    set(source ${PROJECT_BINARY_DIR}/${owner}.cpp)
    file(CONFIGURE OUTPUT ${source} CONTENT "int main() { return 0; }\n")
    if(kind STREQUAL "test")
      add_executable(${owner} ${source})
      target_link_libraries(${owner} PRIVATE vantrell_flags GTest::gmock GTest::gtest_main)
      target_precompile_headers(${owner} PRIVATE ${VANTRELL_COMMON_HEADERS}
        <filesystem> <gmock/gmock.h> <gtest/gtest.h>)
    else()
      add_library(${owner} STATIC ${source})
      target_link_libraries(${owner} PRIVATE vantrell_flags)
      target_precompile_headers(${owner} PRIVATE ${VANTRELL_COMMON_HEADERS})
    endif()
  endif()
  target_precompile_headers(${name} REUSE_FROM ${owner})
endfunction()

# vantrell_library(NAME SOURCES a.cpp b.cpp LINK other_library ...)
function(vantrell_library name)
  cmake_parse_arguments(arg "" "" "SOURCES;LINK" ${ARGN})
  add_library(${name} STATIC ${arg_SOURCES})
  target_link_libraries(${name} PUBLIC vantrell_flags ${arg_LINK})
  vantrell_share_headers(${name} library)
endfunction()

# vantrell_test(NAME SOURCES a_test.cpp LINK library ... LABELS label ...)
# Every test of the program becomes a ctest of its own; TIMEOUT is in seconds.
function(vantrell_test name)
  if(NOT VANTRELL_BUILD_TESTS)
    return()
  endif()
  cmake_parse_arguments(arg "" "TIMEOUT" "SOURCES;LINK;LABELS" ${ARGN})
  if(NOT arg_TIMEOUT)
    set(arg_TIMEOUT 120)
  endif()
  add_executable(${name} ${arg_SOURCES})
  target_link_libraries(${name} PRIVATE vantrell_flags ${arg_LINK} GTest::gmock GTest::gtest_main)
  vantrell_share_headers(${name} test)
  foreach(source ${arg_SOURCES})
    cmake_path(ABSOLUTE_PATH source BASE_DIRECTORY ${CMAKE_CURRENT_SOURCE_DIR} NORMALIZE)
    set_property(GLOBAL APPEND PROPERTY VANTRELL_TEST_SOURCES ${source})
  endforeach()
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST DISCOVERY_TIMEOUT 60
    PROPERTIES TIMEOUT ${arg_TIMEOUT} LABELS "${arg_LABELS}")
endfunction()

# A test file in no target would never run, and nobody would notice.
function(vantrell_refuse_orphan_tests)
  get_property(known GLOBAL PROPERTY VANTRELL_TEST_SOURCES)
  file(GLOB_RECURSE found CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/src/*_test.cpp
       ${PROJECT_SOURCE_DIR}/tests/*_test.cpp)
  foreach(file ${found})
    if(NOT file IN_LIST known)
      message(FATAL_ERROR "${file} is in no test target: list it in a vantrell_test() call")
    endif()
  endforeach()
endfunction()
