# How every library, program and test of the tree is declared.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)

set(QUIRNEL_SANITIZE "" CACHE STRING "Sanitizers for all of our code: empty, 'address,undefined' or 'thread'")

find_program(QUIRNEL_CCACHE ccache)
if(QUIRNEL_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  # One cache for every checkout, wherever it lies.
  set(CMAKE_CXX_COMPILER_LAUNCHER "${CMAKE_COMMAND}" -E env
    CCACHE_NOHASHDIR=1 "CCACHE_BASEDIR=${PROJECT_SOURCE_DIR}" "${QUIRNEL_CCACHE}")
endif()

# ccache keeps single files and cannot always keep what was compiled with a precompiled header; optimised, GCC 12 warns of
# what it inlines from one (-Wstringop-overread in std::string::find). So it is the trees for tests that gain by it.
set(QUIRNEL_PRECOMPILE_DEFAULT OFF)
if(QUIRNEL_SANITIZE AND NOT CMAKE_CXX_COMPILER_LAUNCHER AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  set(QUIRNEL_PRECOMPILE_DEFAULT ON)
endif()
option(QUIRNEL_PRECOMPILE "Parse the standard library's and GoogleTest's headers once a tree" ${QUIRNEL_PRECOMPILE_DEFAULT})

add_library(quirnel_options INTERFACE)
target_compile_options(quirnel_options INTERFACE
  -Wall -Wextra -Wshadow -Wconversion -Wnon-virtual-dtor -Woverloaded-virtual -Werror
  -Wno-multichar # type codes and message codes are four-character constants
  $<$<CXX_COMPILER_ID:Clang>:-Wthread-safety>)
if(QUIRNEL_SANITIZE)
  target_compile_options(quirnel_options INTERFACE
    -fsanitize=${QUIRNEL_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all
    $<$<BOOL:$<TARGET_PROPERTY:QUIRNEL_ASSERTS>>:-fno-sanitize=null,alignment,object-size,vptr>)
  target_link_options(quirnel_options INTERFACE -fsanitize=${QUIRNEL_SANITIZE})
endif()
if(QUIRNEL_FUZZ)
  target_compile_options(quirnel_options INTERFACE -fsanitize=fuzzer-no-link)
endif()
target_link_libraries(quirnel_options INTERFACE Threads::Threads)

# What most sources spend most of their compilation on. A source includes what it needs all the same: with ccache,
# and in the tree of the fuzzers, nothing is precompiled.
if(QUIRNEL_PRECOMPILE)
  # Where a dependency's flags are others (libmpv's), the headers are read as they are.
  set(CMAKE_PCH_WARN_INVALID OFF)
  set(QUIRNEL_COMMON_HEADERS
    <algorithm> <chrono> <functional> <map> <memory> <mutex> <string> <string_view> <thread> <vector>)
  file(CONFIGURE OUTPUT "${PROJECT_BINARY_DIR}/precompiled_headers.cpp" CONTENT "int main() { return 0; }\n")
  add_library(quirnel_library_headers STATIC EXCLUDE_FROM_ALL "${PROJECT_BINARY_DIR}/precompiled_headers.cpp")
  target_link_libraries(quirnel_library_headers PRIVATE quirnel_options)
  target_precompile_headers(quirnel_library_headers PRIVATE ${QUIRNEL_COMMON_HEADERS})
endif()

# The headers' program is compiled as tests are.
function(quirnel_use_test_headers name)
  if(NOT TARGET quirnel_test_headers)
    add_executable(quirnel_test_headers EXCLUDE_FROM_ALL "${PROJECT_BINARY_DIR}/precompiled_headers.cpp")
    target_link_libraries(quirnel_test_headers PRIVATE quirnel_options GTest::gtest)
    quirnel_compile_as_test(quirnel_test_headers)
    target_precompile_headers(quirnel_test_headers PRIVATE ${QUIRNEL_COMMON_HEADERS} <filesystem> <gtest/gtest.h>)
  endif()
  target_precompile_headers(${name} REUSE_FROM quirnel_test_headers)
endfunction()

# Assertions take twice as long to compile when they are optimised, or looked into for what their own pointers point to;
# what they test is both.
function(quirnel_compile_as_test name)
  target_compile_options(${name} PRIVATE $<$<CONFIG:Debug>:-O0>)
  set_target_properties(${name} PROPERTIES QUIRNEL_ASSERTS ON)
endfunction()

# quirnel_library(NAME SOURCES a.cpp ... [PUBLIC lib ...] [PRIVATE lib ...])
# A static library whose own folder is on its users' include path.
function(quirnel_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;PUBLIC;PRIVATE" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_include_directories(${name} PUBLIC "${CMAKE_CURRENT_SOURCE_DIR}")
  target_link_libraries(${name} PUBLIC ${ARG_PUBLIC} PRIVATE quirnel_options ${ARG_PRIVATE})
  if(QUIRNEL_PRECOMPILE)
    target_precompile_headers(${name} REUSE_FROM quirnel_library_headers)
  endif()
endfunction()

# quirnel_program(NAME SOURCES a.cpp ... LINKS lib ...)
function(quirnel_program name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LINKS} quirnel_options)
endfunction()

# quirnel_application(TARGET SIGNATURE signature LAUNCH multiple|single|exclusive [BACKGROUND] DESTINATION dir)
# Says how a program that is built here is launched: writes its record (docs/applications.md) into the build tree, and
# installs one that names the program in that directory below the prefix.
function(quirnel_application target)
  cmake_parse_arguments(ARG "BACKGROUND" "SIGNATURE;LAUNCH;DESTINATION" "" ${ARGN})
  string(TOLOWER "${ARG_SIGNATURE}" leaf)
  string(REPLACE "/" "," leaf "${leaf}")
  set(background "")
  if(ARG_BACKGROUND)
    set(background "Background=true\n")
  endif()
  foreach(place IN ITEMS build install)
    set(executable "$<TARGET_FILE:${target}>")
    set(path "${PROJECT_BINARY_DIR}/share/bekits/applications/${leaf}.app")
    if(place STREQUAL "install")
      set(executable "${ARG_DESTINATION}/$<TARGET_FILE_NAME:${target}>")
      set(path "${PROJECT_BINARY_DIR}/installed-records/${leaf}.app")
    endif()
    file(GENERATE OUTPUT "${path}" CONTENT
      "[Application]\nSignature=${ARG_SIGNATURE}\nExecutable=${executable}\nLaunch=${ARG_LAUNCH}\n${background}")
  endforeach()
  install(TARGETS ${target} DESTINATION "${ARG_DESTINATION}")
  install(FILES "${path}" DESTINATION share/bekits/applications)
endfunction()

# quirnel_test(NAME TIER quick|full|desktop|soak SOURCES a.cpp ... LINKS lib ... [TIMEOUT seconds] [SERIAL])
# One GoogleTest program, run as one ctest entry labelled with its tier.
# Every source under tests/ must come through here (or quirnel_test_sources).
function(quirnel_test name)
  cmake_parse_arguments(ARG "SERIAL" "TIER;TIMEOUT" "SOURCES;LINKS" ${ARGN})
  if(NOT ARG_TIER)
    set(ARG_TIER quick)
  endif()
  if(NOT ARG_TIMEOUT)
    set(ARG_TIMEOUT 300)
  endif()
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LINKS} quirnel_options GTest::gtest GTest::gmock GTest::gtest_main)
  target_include_directories(${name} PRIVATE "${PROJECT_SOURCE_DIR}" "${PROJECT_SOURCE_DIR}/tests")
  quirnel_compile_as_test(${name})
  if(QUIRNEL_PRECOMPILE)
    quirnel_use_test_headers(${name})
  endif()
  add_test(NAME ${name} COMMAND ${name})
  set_tests_properties(${name} PROPERTIES LABELS ${ARG_TIER} TIMEOUT ${ARG_TIMEOUT}
    ENVIRONMENT "QT_QPA_PLATFORM=offscreen;TSAN_OPTIONS=ignore_noninstrumented_modules=1:suppressions=${PROJECT_SOURCE_DIR}/tests/support/tsan.supp;LSAN_OPTIONS=suppressions=${PROJECT_SOURCE_DIR}/tests/support/lsan.supp:print_suppressions=0;UBSAN_OPTIONS=print_stacktrace=1")
  if(ARG_SERIAL)
    set_tests_properties(${name} PROPERTIES RUN_SERIAL TRUE)
  endif()
  quirnel_test_sources(${ARG_SOURCES})
endfunction()

# Declares sources under tests/ that reach the build some other way (support libraries, fuzzers).
function(quirnel_test_sources)
  foreach(source IN LISTS ARGN)
    get_filename_component(path "${source}" ABSOLUTE)
    set_property(GLOBAL APPEND PROPERTY QUIRNEL_TEST_SOURCES "${path}")
  endforeach()
endfunction()

# A test file that nobody runs is an error at configuration time.
function(quirnel_check_every_test_file_is_registered folder)
  file(GLOB_RECURSE present CONFIGURE_DEPENDS "${folder}/*.cpp")
  get_property(registered GLOBAL PROPERTY QUIRNEL_TEST_SOURCES)
  foreach(path IN LISTS present)
    if(NOT path IN_LIST registered)
      message(FATAL_ERROR "${path} is not registered with the build: add it to a quirnel_test() or delete it")
    endif()
  endforeach()
endfunction()
