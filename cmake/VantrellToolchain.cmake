# How everything here is compiled: one language level, one set of warnings, and the fast
# tools where the machine has them.

set(CMAKE_CXX_STANDARD 23)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
if(NOT CMAKE_BUILD_TYPE)
  set(CMAKE_BUILD_TYPE RelWithDebInfo CACHE STRING "" FORCE)
endif()

set(VANTRELL_SANITIZE "" CACHE STRING "Sanitizers to build with, as -fsanitize= takes them")
option(VANTRELL_ASSERTIONS "Check what only a programming error can break" OFF)

add_library(vantrell_flags INTERFACE)
target_compile_options(vantrell_flags INTERFACE
  -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
  target_compile_options(vantrell_flags INTERFACE -Wthread-safety)
endif()
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  # g++ 12 sees overlapping copies inside std::string's own operator+ (its bug 105651).
  target_compile_options(vantrell_flags INTERFACE -Wno-restrict)
endif()
target_include_directories(vantrell_flags INTERFACE ${PROJECT_SOURCE_DIR}/src)
if(VANTRELL_ASSERTIONS)
  target_compile_definitions(vantrell_flags INTERFACE VANTRELL_ASSERTIONS=1)
endif()
if(VANTRELL_SANITIZE)
  add_compile_options(-fsanitize=${VANTRELL_SANITIZE} -fno-omit-frame-pointer
                      -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${VANTRELL_SANITIZE})
endif()

find_program(VANTRELL_CCACHE ccache)
if(VANTRELL_CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${VANTRELL_CCACHE})
endif()
find_program(VANTRELL_MOLD mold)
if(VANTRELL_MOLD)
  add_link_options(-fuse-ld=mold)
endif()
