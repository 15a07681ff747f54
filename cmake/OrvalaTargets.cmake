# One function per kind of target, so that every library, program and test is built with the same
# language level, warnings and sanitizers.

set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_AUTOMOC_MOC_OPTIONS --no-notes)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)

find_program(ORVALA_CCACHE ccache)
if(ORVALA_CCACHE)
  # What ccache asks for before it takes part in a build with precompiled headers.
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_COMMAND} -E env
      CCACHE_SLOPPINESS=pch_defines,time_macros,include_file_mtime,include_file_ctime
      ${ORVALA_CCACHE})
endif()

function(orvala_settings target)
  target_compile_options(${target} PRIVATE -Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor
                                           -Woverloaded-virtual)
  if(CMAKE_CXX_COMPILER_ID STREQUAL Clang)
    # It warns about what the kernel's macros do.
    target_compile_options(${target} PRIVATE -Wno-sign-compare)
  endif()
  if(ORVALA_WERROR)
    target_compile_options(${target} PRIVATE -Werror)
  endif()
  if(ORVALA_SANITIZE)
    target_compile_options(${target} PRIVATE -fsanitize=address,undefined -fno-omit-frame-pointer)
    target_link_options(${target} PRIVATE -fsanitize=address,undefined)
  endif()
  if(ORVALA_FUZZ)
    target_compile_options(${target} PRIVATE -fsanitize=fuzzer-no-link)
  endif()
endfunction()

function(orvala_qt_definitions target)
  target_compile_definitions(${target} PRIVATE QT_NO_FOREACH QT_NO_JAVA_STYLE_ITERATORS
                                               QT_DEPRECATED_WARNINGS)
endfunction()

function(orvala_qt_settings target)
  set_target_properties(${target} PROPERTIES AUTOMOC ON)
  orvala_qt_definitions(${target})
  get_target_property(type ${target} TYPE)
  if(type STREQUAL EXECUTABLE)
    orvala_use_headers(${target} orvala_qt_program_headers)
  else()
    orvala_use_headers(${target} orvala_qt_headers)
  endif()
endfunction()

# orvala_library(<name> SOURCES <files> LINKS <targets>): a static library of the client, one for
# each folder below src/. Includes are written from src/, as in "network/connection.h".
function(orvala_library name)
  cmake_parse_arguments(arg "" "" "SOURCES;LINKS" ${ARGN})
  add_library(orvala_${name} STATIC ${arg_SOURCES})
  target_include_directories(orvala_${name} PUBLIC ${CMAKE_SOURCE_DIR}/src)
  target_link_libraries(orvala_${name} PUBLIC ${arg_LINKS})
  orvala_settings(orvala_${name})
  orvala_qt_settings(orvala_${name})
endfunction()

# orvala_program(<name> SOURCES <files> LINKS <targets> [QT]): an executable.
function(orvala_program name)
  cmake_parse_arguments(arg "QT" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${name} ${arg_SOURCES})
  target_link_libraries(${name} PRIVATE ${arg_LINKS})
  orvala_settings(${name})
  if(arg_QT)
    orvala_qt_settings(${name})
  endif()
endfunction()

# orvala_test(<name> SOURCES <files> LINKS <targets>): a QtTest program, run by ctest on the
# off-screen platform.
function(orvala_test name)
  cmake_parse_arguments(arg "" "" "SOURCES;LINKS" ${ARGN})
  orvala_program(${name} QT SOURCES ${arg_SOURCES} LINKS ${arg_LINKS} Qt5::Test)
  target_include_directories(${name} PRIVATE ${CMAKE_SOURCE_DIR}/tests)
  set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/tests)
  add_test(NAME ${name} COMMAND ${name})
  set_tests_properties(${name} PROPERTIES
    ENVIRONMENT "QT_QPA_PLATFORM=offscreen;LSAN_OPTIONS=suppressions=${CMAKE_SOURCE_DIR}/cmake/leaks.supp:print_suppressions=0"
    TIMEOUT 120)
endfunction()

# orvala_gtest(<name> SOURCES <files> LINKS <targets>): a GoogleTest program, run by ctest.
function(orvala_gtest name)
  cmake_parse_arguments(arg "" "" "SOURCES;LINKS" ${ARGN})
  orvala_program(${name} SOURCES ${arg_SOURCES} LINKS ${arg_LINKS} GTest::gtest GTest::gtest_main)
  target_include_directories(${name} PRIVATE ${CMAKE_SOURCE_DIR}/tests)
  set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/tests)
  add_test(NAME ${name} COMMAND ${name})
  set_tests_properties(${name} PROPERTIES TIMEOUT 120)
endfunction()

# orvala_bench(<name> SOURCES <files> LINKS <targets> [QT]): a benchmark program; it prints rows for
# the table of bench/run (see bench/support/bench.h) and is no test.
function(orvala_bench name)
  cmake_parse_arguments(arg "QT" "" "SOURCES;LINKS" ${ARGN})
  if(arg_QT)
    set(qt QT)
  endif()
  orvala_program(${name} ${qt} SOURCES ${arg_SOURCES} LINKS ${arg_LINKS})
  target_include_directories(${name} PRIVATE ${CMAKE_SOURCE_DIR}/bench)
  set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bench)
endfunction()

# orvala_subdirectories(<dirs>): add each folder that has a build file.
function(orvala_subdirectories)
  foreach(dir ${ARGN})
    if(EXISTS ${CMAKE_CURRENT_SOURCE_DIR}/${dir}/CMakeLists.txt)
      add_subdirectory(${dir})
    endif()
  endforeach()
endfunction()
