# What every target of the project is compiled with. Targets link `velk_options`.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/lib)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)

find_package(Threads REQUIRED)

add_library(velk_options INTERFACE)
target_compile_options(velk_options INTERFACE
  -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  # Sees overlaps in std::string's operator+ that cannot be (GCC bug 105651), and unset strings in
  # lists of structs whose members all have initialisers.
  target_compile_options(velk_options INTERFACE -Wno-restrict -Wno-maybe-uninitialized)
endif()
# 64-bit file offsets and inode numbers also where `long` has 32 bits.
target_compile_definitions(velk_options INTERFACE _GNU_SOURCE _FILE_OFFSET_BITS=64)
target_link_libraries(velk_options INTERFACE Threads::Threads ${CMAKE_DL_LIBS})

target_link_options(velk_options INTERFACE -Wl,-z,relro,-z,now)

# Apart, because third-party sources built here take the sanitizers but not the warnings.
add_library(velk_sanitizers INTERFACE)
if(VELK_SANITIZE)
  target_compile_options(velk_sanitizers INTERFACE
    -fsanitize=${VELK_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all
    $<$<BOOL:$<TARGET_PROPERTY:VELK_UNDEFINED_UNCHECKED>>:-fno-sanitize=undefined>)
  target_link_options(velk_sanitizers INTERFACE -fsanitize=${VELK_SANITIZE})
endif()
target_link_libraries(velk_options INTERFACE velk_sanitizers)
if(VELK_SANITIZE AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  # Instrumented code hides from GCC that an array is not null; the other builds keep the warning.
  target_compile_options(velk_options INTERFACE -Wno-format-overflow)
endif()

if(VELK_COVERAGE)
  target_compile_options(velk_options INTERFACE --coverage -fprofile-update=atomic)
  target_link_options(velk_options INTERFACE --coverage)
endif()
