# Helpers shared by every folder: warnings, sanitizers, libraries, tests, fuzzers.

set(FK_WARNINGS -Wall -Wextra)
set(FK_SANITIZER_FLAGS -fsanitize=address,undefined,leak -fno-omit-frame-pointer -fno-sanitize-recover=undefined)

function(fk_apply_common_options target)
  target_compile_options(${target} PRIVATE ${FK_WARNINGS})
  if(FK_SANITIZE)
    target_compile_options(${target} PRIVATE ${FK_SANITIZER_FLAGS})
    target_link_options(${target} PRIVATE ${FK_SANITIZER_FLAGS})
  endif()
endfunction()

# fk_add_library(name SOURCES ... DEPS ...): a static library of one folder. A library of
# the package (not a test double) is installed with its headers and gets the name users
# write, formkit::<folder> (formkit_core is formkit::core), also as an alias in the build.
function(fk_add_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  # Inside the package headers name each other from its top ("core/Designers.h"); users
  # write <formkit/core/Designers.h>.
  target_include_directories(${name} PUBLIC $<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}>
                                            $<INSTALL_INTERFACE:include> $<INSTALL_INTERFACE:include/formkit>)
  if(NOT name MATCHES "^formkit_testsupport" AND NOT CMAKE_CURRENT_SOURCE_DIR MATCHES "/(tests|bench|fuzz)(/|$)")
    string(REGEX REPLACE "^formkit_" "" short ${name})
    set_target_properties(${name} PROPERTIES EXPORT_NAME ${short})
    add_library(formkit::${short} ALIAS ${name})
    set_property(GLOBAL APPEND PROPERTY FK_PACKAGE_LIBRARIES ${name})
    install(TARGETS ${name} EXPORT formkitTargets ARCHIVE DESTINATION lib)
    file(RELATIVE_PATH folder ${PROJECT_SOURCE_DIR} ${CMAKE_CURRENT_SOURCE_DIR})
    install(DIRECTORY ${CMAKE_CURRENT_SOURCE_DIR}/ DESTINATION include/formkit/${folder}
            FILES_MATCHING PATTERN "*.h" PATTERN "CMakeFiles" EXCLUDE)
  endif()
  target_link_libraries(${name} PUBLIC ${ARG_DEPS})
  fk_apply_common_options(${name})
  if(FK_SANITIZE)
    target_compile_options(${name} PUBLIC ${FK_SANITIZER_FLAGS})
    target_link_options(${name} PUBLIC ${FK_SANITIZER_FLAGS})
    # In the test build a programming error that would corrupt memory stops the program.
    target_compile_definitions(${name} PRIVATE FK_ABORT_ON_DANGLING_REFERENCE)
  endif()
  if(FK_FUZZ)
    # Coverage for the fuzz targets that link the library; no fuzzer main here.
    target_compile_options(${name} PRIVATE -fsanitize=fuzzer-no-link)
  endif()
endfunction()

# fk_add_test_support(name SOURCES ... DEPS ...): test doubles and fixtures shared by the
# test programs, benchmarks and fuzz targets, which link them instead of compiling each
# other's sources. Built with the same options as the libraries they stand beside (so the
# fuzz targets see their coverage too), only when tests or benchmarks are, and never part of
# a release library.
function(fk_add_test_support name)
  fk_add_library(${name} ${ARGN})
  if(NOT FK_TESTS)
    # Only benchmarks link them then: build those they name, not every double.
    set_target_properties(${name} PROPERTIES EXCLUDE_FROM_ALL ON)
  endif()
endfunction()

# fk_add_test(name SOURCES ... DEPS ...): one GoogleTest program, registered with CTest.
# CTest runs it twice in a shuffled order (seed FK_TEST_SEED), so a test that leans on what
# another left behind, or leaves something behind itself, fails. Nothing without FK_TESTS.
function(fk_add_test name)
  if(NOT FK_TESTS)
    return()
  endif()
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  find_package(GTest REQUIRED)
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_DEPS} GTest::gtest GTest::gtest_main)
  fk_apply_common_options(${name})
  add_test(NAME ${name}
           COMMAND ${name} --gtest_brief=1 --gtest_shuffle --gtest_repeat=2
                   --gtest_random_seed=${FK_TEST_SEED})
endfunction()

# fk_add_fuzzer(name SOURCES ... DEPS ... CORPUS dir RUNS n MAXLEN bytes): a libFuzzer
# target, run by CTest for a bounded number of executions (default 20000) over its seed
# corpus, with inputs of at most MAXLEN bytes (default 4096). libFuzzer writes new inputs
# into the first corpus directory, so a scratch directory of the build tree goes first and
# the seeds of the source tree second: the source tree is never written.
function(fk_add_fuzzer name)
  cmake_parse_arguments(ARG "" "CORPUS;RUNS;MAXLEN" "SOURCES;DEPS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_DEPS})
  fk_apply_common_options(${name})
  target_compile_options(${name} PRIVATE -fsanitize=fuzzer)
  target_link_options(${name} PRIVATE -fsanitize=fuzzer)
  if(NOT ARG_RUNS)
    set(ARG_RUNS 20000)
  endif()
  if(NOT ARG_MAXLEN)
    set(ARG_MAXLEN 4096)
  endif()
  set(scratch ${CMAKE_CURRENT_BINARY_DIR}/scratch-corpus)
  file(MAKE_DIRECTORY ${scratch})
  add_test(NAME ${name}
           COMMAND ${name} -runs=${ARG_RUNS} -seed=1 -max_len=${ARG_MAXLEN} ${scratch} ${ARG_CORPUS})
endfunction()

# fk_add_bench(name SOURCES ... DEPS ...): a Google Benchmark program.
function(fk_add_bench name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  find_package(benchmark REQUIRED)
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_DEPS} benchmark::benchmark)
  fk_apply_common_options(${name})
endfunction()
