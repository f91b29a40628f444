# cmake -DNM=.. -DLIBRARY=.. [-DSANITIZE=..] [-DCOVERAGE=ON] -P CheckImports.cmake
#
# What the library takes from its process: the C and C++ runtimes, and weakly the broker's context
# clone. Of the runtimes it takes no iostreams, no environment variable and no throw.

cmake_minimum_required(VERSION 3.25)
include(${CMAKE_CURRENT_LIST_DIR}/DynamicSymbols.cmake)

if(SANITIZE)
  message("skipped: the runtime of -fsanitize=${SANITIZE} is among the imports")
  return()
endif()

set(runtime_versions "@@?(GLIBC|GLIBCXX|CXXABI|GCC)_[0-9A-Za-z_.]+$")
# The last three are hooks that the compiler's start-up objects refer to.
set(weak_names native_clone_CMPIContext
    __gmon_start__ _ITM_registerTMCloneTable _ITM_deregisterTMCloneTable)
set(forbidden getenv secure_getenv __secure_getenv __cxa_throw __cxa_rethrow)
if(COVERAGE)
  list(REMOVE_ITEM forbidden getenv)  # libgcov reads where to write its data
endif()

set(complaints "")
velk_read_symbols(lines --undefined-only)
foreach(line IN LISTS lines)
  string(REGEX MATCH "^([^ ]+) ([A-Za-z])" line "${line}")
  set(symbol ${CMAKE_MATCH_1})
  set(type ${CMAKE_MATCH_2})
  string(REGEX REPLACE "@.*$" "" name ${symbol})
  if(name IN_LIST forbidden)
    list(APPEND complaints "forbidden: ${symbol}")
  elseif(name IN_LIST weak_names)
    if(NOT type MATCHES "^[wv]$")
      list(APPEND complaints "not weak: ${symbol}")
    endif()
  elseif(NOT symbol MATCHES "${runtime_versions}")
    list(APPEND complaints "not of the C or C++ runtime: ${symbol}")
  endif()
endforeach()

set(streams "std::(__cxx11::)?(basic_)?(i|o|io|if|of|f|istring|ostring|string)stream")
string(APPEND streams "|std::(basic_)?ios|std::w?(cout|cerr|clog|cin)[^a-z]")
velk_read_symbols(lines --undefined-only --demangle)
foreach(line IN LISTS lines)
  if(line MATCHES "${streams}")
    string(REGEX REPLACE " U *$" "" line "${line}")
    list(APPEND complaints "iostreams: ${line}")
  endif()
endforeach()
velk_report("${LIBRARY} takes more from its process than it may" ${complaints})
