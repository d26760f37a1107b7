# Sources compiled in batches: most of the time that a source takes goes into headers that its
# neighbours include too. To the compiler a batch is one source, so files that give the same name to
# different things of their own go into different batches. Builds without batches, as the presets
# are by themselves, are for work on a few files, and find a forgotten #include.
option(QEL_BATCHES "Compile the sources of a target in batches, which takes half the time" OFF)
set(QEL_BATCH_SIZE 40)
set(QEL_NAME_WARNINGS -Wshadow)
if(QEL_BATCHES AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  set(QEL_NAME_WARNINGS -Wshadow=local -Wno-subobject-linkage)  # neighbours' names do not count
  add_compile_options(--param=ggc-min-heapsize=400000)  # kB; a batch fills the usual ones often
elseif(QEL_BATCHES)
  set(QEL_NAME_WARNINGS)  # others cannot tell neighbours' names from a function's own
endif()

# The names that a source declares outside of functions and classes. Each NAME comes with what it
# stands for in a variable own_NAME: what is taken over with using is the same everywhere.
macro(qel_read_own_names source)
  file(READ ${source} text)
  string(REGEX REPLACE "[][;\\]" " " text "${text}")  # lists trip over these
  string(REGEX MATCHALL "\n[A-Za-z][^\n]*" lines "${text}")
  set(own_names)
  foreach(line IN LISTS lines)
    set(meaning ${source})
    if(line MATCHES "^\n(TEST|TYPED_TEST|INSTANTIATE|namespace [a-z:]+ {|using namespace|.*operator)" OR
       line MATCHES "^\n[^({=]*[A-Za-z0-9_>]::~?[A-Za-z0-9_]+\\(")  # of a class
      continue()
    elseif(line MATCHES "^\n(using|namespace) ([A-Za-z0-9_]+) =" OR
           line MATCHES "^\n(using) .*:([A-Za-z0-9_]+) *$")
      set(names ${CMAKE_MATCH_2})
      string(REPLACE " ::" " " meaning "${line}")
    elseif(line MATCHES "^\nenum ")
      string(REGEX MATCHALL "[A-Za-z0-9_]+" names "${line}")
      list(REMOVE_ITEM names enum class std uint8_t uint16_t)
    elseif(line MATCHES "^\n(struct|class|MATCHER[_P0-9]*) ?\\(?([A-Za-z0-9_]+)" OR
           line MATCHES "(^| |[*&])([A-Za-z0-9_]+) *[({=]")
      set(names ${CMAKE_MATCH_2})
    else()
      continue()
    endif()
    foreach(name IN LISTS names)
      list(APPEND own_names ${name})
      set(own_${name} "${meaning}")
    endforeach()
  endforeach()
endmacro()

# Every source goes into the first batch that has room for it and no other thing of the same name.
function(qel_compile_in_batches target)
  if(NOT QEL_BATCHES)
    return()
  endif()
  get_target_property(sources ${target} SOURCES)
  list(FILTER sources INCLUDE REGEX "^[^$]*\\.cpp$")
  set(made ${sources})
  list(FILTER made INCLUDE REGEX "/qmlcache/")
  set_source_files_properties(${made} PROPERTIES UNITY_GROUP ${target}_qml)
  list(FILTER sources EXCLUDE REGEX "^${CMAKE_BINARY_DIR}")  # is not made yet, and big
  set(last 0)
  set(size_0 0)
  foreach(source IN LISTS sources)
    cmake_path(ABSOLUTE_PATH source NORMALIZE)
    qel_read_own_names(${source})
    set(batch 0)
    while(batch LESS_EQUAL last)
      set(fits TRUE)
      if(size_${batch} GREATER_EQUAL QEL_BATCH_SIZE)
        set(fits FALSE)
      endif()
      foreach(name IN LISTS own_names)
        if(DEFINED in_${batch}_${name} AND NOT in_${batch}_${name} STREQUAL own_${name})
          set(fits FALSE)
          break()
        endif()
      endforeach()
      if(fits)
        break()
      endif()
      math(EXPR batch "${batch} + 1")
    endwhile()
    if(batch GREATER last)
      set(last ${batch})
      set(size_${batch} 0)
    endif()
    math(EXPR size_${batch} "${size_${batch}} + 1")
    foreach(name IN LISTS own_names)
      set(in_${batch}_${name} "${own_${name}}")
    endforeach()
    set_source_files_properties(${source} PROPERTIES UNITY_GROUP ${target}_${batch})
  endforeach()
  set_target_properties(${target} PROPERTIES UNITY_BUILD ON UNITY_BUILD_MODE GROUP)
endfunction()
