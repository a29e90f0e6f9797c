# What every target of the project shares: the language level, warnings, visibility, sanitizers, ccache.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/bin)
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/lib)
set(CMAKE_BUILD_RPATH_USE_ORIGIN ON)
set(CMAKE_INSTALL_RPATH "$ORIGIN/../lib")

if(NOT CMAKE_BUILD_TYPE)
  set(CMAKE_BUILD_TYPE Release CACHE STRING "Build type" FORCE)
endif()

set(TESSEL_SANITIZE "" CACHE STRING "Sanitizers to build with, such as address,undefined or thread")
option(TESSEL_FUZZ "Build the fuzzers of tests/fuzz; needs Clang" OFF)

find_program(CCACHE_PROGRAM ccache)
if(CCACHE_PROGRAM)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CCACHE_PROGRAM})
endif()

add_compile_options(-Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
add_compile_options(-fno-semantic-interposition -fno-plt)  # the libraries are one product
add_link_options(-Wl,--no-undefined -Wl,--as-needed -Wl,-z,now)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  add_compile_options(-Wno-restrict)  # warns of std::string's own operator+
endif()
include_directories(${PROJECT_SOURCE_DIR})

if(TESSEL_SANITIZE)
  add_compile_options(-fsanitize=${TESSEL_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer -g)
  add_link_options(-fsanitize=${TESSEL_SANITIZE})
endif()

# A fuzzer sees how far it got in everything that is compiled so. Its libraries are static: a shared one cannot
# resolve the sanitizer's symbols, which stand in the program.
set(TESSEL_LIBRARY_KIND SHARED)
if(TESSEL_FUZZ)
  add_compile_options(-fsanitize=fuzzer-no-link)
  set(TESSEL_LIBRARY_KIND STATIC)
endif()

# A shared library of the house: NAME is the target and the file's base name.
function(tessel_library NAME)
  add_library(${NAME} ${TESSEL_LIBRARY_KIND} ${ARGN})
endfunction()
