# How every target of the house is compiled, and the two functions that declare libraries and tests.

set(KLDR_WORD_SIZE "" CACHE STRING "32 builds for i386; empty builds for the compiler's own word size")
set(KLDR_SANITIZE "" CACHE STRING "argument of -fsanitize, empty for none")
option(KLDR_RELEASE "build as distributions ask it of packages: hardened, with nothing of the build's folder in what is built" OFF)
option(KLDR_CONTAIN_EXCEPTIONS "answer an exception with a failure, rather than letting it pass into the CIM server" OFF)
set(KLDR_CMPI_INCLUDE_DIR "${CMAKE_SOURCE_DIR}/contracts/cmpi" CACHE PATH
    "folder of cmpidt.h, cmpift.h and cmpimacs.h; a server's own headers may stand in for ours")

option(KLDR_SHARE_RUNS "let files of the module share compiler runs, as those of other targets do" OFF)

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_CXX_FLAGS_RELWITHDEBINFO "-O2 -g1")

find_program(KLDR_CCACHE ccache)
if(KLDR_CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${KLDR_CCACHE})
endif()

# Records are walked through their metadata, from addresses: no compiler may reason about their types. Unique symbols would
# keep the library mapped after its last close. To clang, which fuzzes and follows the locks, a name in an enumeration of its own
# shadows too.
set(gnu $<CXX_COMPILER_ID:GNU>)
set(clang $<CXX_COMPILER_ID:Clang>)
add_compile_options(-Wall -Wextra $<${gnu}:-Wshadow> -Wnon-virtual-dtor -Wpedantic -Werror -Wno-invalid-offsetof
                    -fno-strict-aliasing $<${gnu}:-fno-gnu-unique> $<${clang}:-Wthread-safety>)
# 64-bit offsets and times also where a word is 32 bits: a log grows without limit, and so does time.
add_compile_definitions(_GNU_SOURCE _FILE_OFFSET_BITS=64 _TIME_BITS=64)
include_directories(${CMAKE_SOURCE_DIR} ${CMAKE_BINARY_DIR}/generated)

if(KLDR_WORD_SIZE STREQUAL "32")
  add_compile_options(-m32)
  add_link_options(-m32)
endif()
if(KLDR_RELEASE)
  # The later map wins, so that a build folder anywhere reads as one in the sources. Whole debug information: it is a package of
  # its own.
  # A user of ccache may have it make paths relative to a folder, and the debug information would show that.
  if(KLDR_CCACHE)
    list(PREPEND CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_COMMAND} -E env CCACHE_BASEDIR=)
  endif()
  include(CheckPIESupported)
  check_pie_supported()
  add_compile_options(-g -ffile-prefix-map=${CMAKE_SOURCE_DIR}=. -ffile-prefix-map=${CMAKE_BINARY_DIR}=./build
                      -U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2 -fstack-protector-strong -fstack-clash-protection -fcf-protection)
  add_link_options(-Wl,-z,relro -Wl,-z,now)
endif()
if(KLDR_SANITIZE)
  # Less optimisation and no vague promises: a report should name a line.
  add_compile_options(-fsanitize=${KLDR_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer -O1)
  add_link_options(-fsanitize=${KLDR_SANITIZE})
endif()

# kldr_share_runs(): from here on a few files share a compiler run, which is several times faster. That each file stands for
# itself is for another preset to tell; some warnings take the files of a shared run for headers.
macro(kldr_share_runs)
  set(CMAKE_UNITY_BUILD ON)
  set(CMAKE_UNITY_BUILD_BATCH_SIZE 16)
  add_compile_options(-Wno-shadow $<${gnu}:-Wno-subobject-linkage>)
endmacro()

# kldr_apart(<file> ...): files with a run of their own, where they must be linked or left out by themselves.
function(kldr_apart)
  set_source_files_properties(${ARGN} PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)
endfunction()

find_package(Threads REQUIRED)

# Linked by name: the compiler's search path finds the library of the word size in hand.
add_library(kldr_jsoncpp INTERFACE)
target_include_directories(kldr_jsoncpp SYSTEM INTERFACE /usr/include/jsoncpp)
target_link_libraries(kldr_jsoncpp INTERFACE -ljsoncpp)

# kldr_library(<name> SOURCES ... LIBS ...): a static, position-independent library.
function(kldr_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LIBS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  target_link_libraries(${name} PUBLIC ${ARG_LIBS} Threads::Threads ${CMAKE_DL_LIBS})
endfunction()

# Without optimisation there is nothing to fortify.
set(KLDR_TEST_OPTIONS -O0 -U_FORTIFY_SOURCE)
set(KLDR_OWN_PROCESSES ${CMAKE_SOURCE_DIR}/tests/support/own_processes.sh)
if(KLDR_SANITIZE MATCHES "undefined")
  list(APPEND KLDR_TEST_OPTIONS -fno-sanitize=undefined)
endif()

# They go first in a build folder that has not seen yet how long its tests take: begun last, one of them would end alone.
set(KLDR_LONG_TESTS module_test faults_test bad_answers_test bad_answers_alone_test allocation_failures_test missing_symbols_test
    module_diagnostics_test broker_test alerts_test simulator_test kldrcim_test)

# What every test of a sanitized build is started with. How the leak checker learns where the thread-local storage of an opened
# library lies is a guess that C libraries of today prove wrong: it reads wild memory at the end of the process. A child that
# is forked where threads are starts threads of its own.
set(KLDR_SANITIZER_OPTIONS "")
if(KLDR_SANITIZE MATCHES "address")
  set(KLDR_SANITIZER_OPTIONS
    "LSAN_OPTIONS=suppressions=${CMAKE_SOURCE_DIR}/tests/lsan.supp:print_suppressions=0:intercept_tls_get_addr=0")
elseif(KLDR_SANITIZE MATCHES "thread")
  set(KLDR_SANITIZER_OPTIONS "TSAN_OPTIONS=suppressions=${CMAKE_SOURCE_DIR}/tests/tsan.supp:die_after_fork=0")
endif()

# kldr_test(<name> SOURCES ... LIBS ... [ENV K=V ...] [DEPENDS target ...]): a GoogleTest program, run by CTest in its build
# folder, among no processes but its own.
function(kldr_test name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LIBS;ENV;DEPENDS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LIBS} kldr_gtest)
  # Tests are the larger half of the house: they are compiled for the compiler's speed, not for theirs, and it is not they
  # whose behaviour must be defined.
  target_compile_options(${name} PRIVATE ${KLDR_TEST_OPTIONS})
  target_precompile_headers(${name} REUSE_FROM kldr_test_headers)
  if(ARG_DEPENDS)
    add_dependencies(${name} ${ARG_DEPENDS})
  endif()
  add_test(NAME ${name} COMMAND ${KLDR_OWN_PROCESSES} $<TARGET_FILE:${name}>)
  set_tests_properties(${name} PROPERTIES TIMEOUT 900 ENVIRONMENT "${ARG_ENV};${KLDR_SANITIZER_OPTIONS}")
  if(name IN_LIST KLDR_LONG_TESTS)
    set_tests_properties(${name} PROPERTIES COST 10)
  endif()
endfunction()

# GoogleTest comes as source, so that it is built for the word size and the sanitizer in hand. Without its package there are no
# tests, and all else builds.
set(KLDR_GTEST_ROOT /usr/src/googletest/googletest)
if(EXISTS ${KLDR_GTEST_ROOT}/src/gtest-all.cc)
  add_library(kldr_gtest STATIC EXCLUDE_FROM_ALL
              ${KLDR_GTEST_ROOT}/src/gtest-all.cc ${KLDR_GTEST_ROOT}/src/gtest_main.cc)
  target_include_directories(kldr_gtest SYSTEM PUBLIC ${KLDR_GTEST_ROOT}/include PRIVATE ${KLDR_GTEST_ROOT})
  target_compile_options(kldr_gtest PRIVATE -w ${KLDR_TEST_OPTIONS})
  target_link_libraries(kldr_gtest PUBLIC Threads::Threads)

  # What all tests begin with, read once for all of them: a program like theirs, which is only compiled.
  add_executable(kldr_test_headers EXCLUDE_FROM_ALL ${CMAKE_CURRENT_LIST_DIR}/test_headers.cpp)
  target_link_libraries(kldr_test_headers PRIVATE kldr_gtest)
  target_compile_options(kldr_test_headers PRIVATE ${KLDR_TEST_OPTIONS})
  target_precompile_headers(kldr_test_headers PRIVATE <gtest/gtest.h> <algorithm> <fstream> <functional> <map> <thread>)
endif()
