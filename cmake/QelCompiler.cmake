# Language level, warnings, hardening, sanitizers and the compiler cache, the same for every target.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)

find_program(QEL_CCACHE ccache)
if(QEL_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${QEL_CCACHE})
endif()

# The same objects in whatever folder, for the compiler cache and for packages that can be compared.
add_compile_options(-ffile-prefix-map=${CMAKE_SOURCE_DIR}/=)

# Every processor rounds a product before it is added to, as amd64 does: values look the same.
if(NOT CMAKE_SYSTEM_PROCESSOR MATCHES "x86_64|AMD64")
  add_compile_options(-ffp-contract=off)
endif()

# Processors of 32 bits too know times after 2038 and files beyond 2 GiB.
if(CMAKE_SIZEOF_VOID_P EQUAL 4)
  add_compile_definitions(_FILE_OFFSET_BITS=64 _TIME_BITS=64)
endif()

set(QEL_SANITIZE "" CACHE STRING "Sanitizers to build with, as for -fsanitize=")
if(QEL_SANITIZE)
  add_compile_options(-fsanitize=${QEL_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer -g1)
  add_link_options(-fsanitize=${QEL_SANITIZE})
  add_compile_definitions(_GLIBCXX_ASSERTIONS)
  find_program(QEL_LLD ld.lld)  # the usual linker takes long over sanitized objects
  if(QEL_LLD)
    add_link_options(-fuse-ld=lld)
  endif()
endif()

# Hardening of all that is compiled in the calling folder and below, as far as compiler and machine
# have it. Sanitizers look closer themselves. Without optimisation there is nothing to fortify.
include(CheckCXXCompilerFlag)
include(CheckPIESupported)
check_pie_supported()
function(qel_harden_programs)
  if(QEL_SANITIZE)
    return()
  endif()
  add_compile_definitions(_GLIBCXX_ASSERTIONS)
  foreach(flag -fstack-protector-strong -fstack-clash-protection
               -fcf-protection=full -mbranch-protection=standard)  # these of amd64 and of arm64
    string(MAKE_C_IDENTIFIER "QEL_HAS${flag}" has)
    check_cxx_compiler_flag(${flag} ${has})
    if(${has})
      add_compile_options(${flag})
    endif()
  endforeach()
  set(level 2)
  if(CMAKE_CXX_COMPILER_VERSION VERSION_GREATER_EQUAL 12)
    set(level 3)
  endif()
  add_compile_options("$<$<NOT:$<CONFIG:Debug>>:-U_FORTIFY_SOURCE;-D_FORTIFY_SOURCE=${level}>")
  add_link_options(-Wl,-z,relro -Wl,-z,now)
endfunction()

# What fuzzers look at counts the branches it takes, so that they see what an input reached.
option(BUILD_FUZZERS "Build the fuzzers, with clang" OFF)
function(qel_count_branches name)
  if(BUILD_FUZZERS)
    target_compile_options(${name} PRIVATE -fsanitize=fuzzer-no-link)
  endif()
endfunction()

include(QelBatches)

# Our own code only; generated foreign code links without it.
add_library(qel_warnings INTERFACE)
target_compile_options(qel_warnings INTERFACE
  -Wall -Wextra -Wpedantic ${QEL_NAME_WARNINGS} -Wconversion -Wsign-conversion -Wold-style-cast
  -Wnon-virtual-dtor -Woverloaded-virtual -Wformat=2 -Werror
  $<$<CXX_COMPILER_ID:GNU>:-Wno-restrict>)  # GCC 12 sees overlaps in std::string that are not there

# qel_add_library(NAME SOURCES … DEPENDS …): a static library of the viewer, included from src/.
function(qel_add_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPENDS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_include_directories(${name} PUBLIC ${CMAKE_SOURCE_DIR}/src)
  target_link_libraries(${name} PUBLIC ${ARG_DEPENDS} PRIVATE qel_warnings)
  qel_count_branches(${name})
  qel_compile_in_batches(${name})
endfunction()
