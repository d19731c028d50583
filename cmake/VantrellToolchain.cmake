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

# At -O3 g++ 12 warns of copies into strings that are longer than memory, and gains nothing here.
set(CMAKE_CXX_FLAGS_RELEASE "-O2 -DNDEBUG")

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

# Most of the time a file takes goes into the standard library's headers, and GoogleTest's. The
# preset "clang" builds without this, so that a file that forgets an include is found.
option(VANTRELL_PRECOMPILE "Compile the headers that everybody includes once" OFF)

find_program(VANTRELL_CCACHE ccache)
if(VANTRELL_CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${VANTRELL_CCACHE})
  if(VANTRELL_PRECOMPILE AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    # Without these ccache passes over whatever uses a precompiled header.
    set(CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_COMMAND} -E env
        CCACHE_BASEDIR=${PROJECT_SOURCE_DIR} CCACHE_NOHASHDIR=1
        CCACHE_SLOPPINESS=pch_defines,time_macros ${VANTRELL_CCACHE})
    add_compile_options(-fpch-preprocess)
  endif()
endif()

find_program(VANTRELL_MOLD mold)
if(VANTRELL_MOLD)
  add_link_options(-fuse-ld=mold)
endif()
