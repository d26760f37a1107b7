# Language level, warnings, sanitizers and the compiler cache, the same for every target.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)

find_program(QEL_CCACHE ccache)
if(QEL_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${QEL_CCACHE})
endif()

set(QEL_SANITIZE "" CACHE STRING "Sanitizers to build with, as for -fsanitize=")
if(QEL_SANITIZE)
  add_compile_options(-fsanitize=${QEL_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer -g1)
  add_link_options(-fsanitize=${QEL_SANITIZE})
  find_program(QEL_LLD ld.lld)  # the usual linker takes long over sanitized objects
  if(QEL_LLD)
    add_link_options(-fuse-ld=lld)
  endif()
endif()

# Our own code only; generated foreign code links without it.
add_library(qel_warnings INTERFACE)
target_compile_options(qel_warnings INTERFACE
  -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Wsign-conversion -Wold-style-cast
  -Wnon-virtual-dtor -Woverloaded-virtual -Wformat=2 -Werror
  $<$<CXX_COMPILER_ID:GNU>:-Wno-restrict>)  # GCC 12 sees overlaps in std::string that are not there

# Precompiled in the sanitized builds, to save time. Other builds go without, so that a forgotten
# #include is an error.
set(QEL_STANDARD_HEADERS
  <algorithm> <array> <chrono> <cstdint> <deque> <functional> <map> <memory> <mutex> <optional>
  <string> <string_view> <thread> <unordered_map> <variant> <vector>)

# qel_add_library(NAME SOURCES … DEPENDS …): a static library of the viewer, included from src/.
function(qel_add_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPENDS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_include_directories(${name} PUBLIC ${CMAKE_SOURCE_DIR}/src)
  target_link_libraries(${name} PUBLIC ${ARG_DEPENDS} PRIVATE qel_warnings)
  if(QEL_SANITIZE AND TARGET qel_base AND NOT name STREQUAL qel_base)
    target_precompile_headers(${name} REUSE_FROM qel_base)
  elseif(QEL_SANITIZE)
    target_precompile_headers(${name} PRIVATE ${QEL_STANDARD_HEADERS})
  endif()
endfunction()
