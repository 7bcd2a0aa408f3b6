# Helpers shared by every folder: one way to declare a library, a test, a benchmark, a fuzzer.
include_guard(GLOBAL)

# Compiler flags that depend on the preset's options. Warnings are always on.
function(wbt_setup_toolchain_flags)
  add_compile_options(-Wall -Wextra)
  if(WBT_SANITIZE)
    set(san -fsanitize=address,undefined -fno-sanitize=vptr -fno-sanitize-recover=undefined
            -fno-omit-frame-pointer)
    add_compile_options(${san})
    add_link_options(-fsanitize=address,undefined -fno-sanitize=vptr)
  endif()
  if(WBT_TSAN)
    add_compile_options(-fsanitize=thread -fno-omit-frame-pointer)
    add_link_options(-fsanitize=thread)
  endif()
  if(WBT_FUZZ)
    if(NOT CMAKE_CXX_COMPILER_ID MATCHES "Clang")
      message(FATAL_ERROR "WBT_FUZZ needs clang (libFuzzer)")
    endif()
    # Coverage for everything; only the fuzz executables link the libFuzzer driver.
    add_compile_options(-fsanitize=fuzzer-no-link)
  endif()
endfunction()

# Adds every immediate subfolder of DIR that has a CMakeLists.txt.
function(wbt_add_subdirectories dir)
  file(GLOB children LIST_DIRECTORIES true CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/${dir}/*)
  list(SORT children)
  foreach(child IN LISTS children)
    if(IS_DIRECTORY ${child} AND EXISTS ${child}/CMakeLists.txt)
      add_subdirectory(${child})
    endif()
  endforeach()
endfunction()

# wbt_add_library(NAME SOURCES ... [DEPS ...]): a static library whose headers sit beside its
# sources; users include them as "<folder>/<Header>.h" relative to src/.
function(wbt_add_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  add_library(${name} STATIC ${ARG_SOURCES})
  add_library(wbt::${name} ALIAS ${name})
  target_include_directories(${name} PUBLIC $<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/src>)
  target_compile_features(${name} PUBLIC cxx_std_20)
  target_link_libraries(${name} PUBLIC ${ARG_DEPS})
endfunction()

# wbt_add_test(NAME SOURCES ... [DEPS ...]): one GoogleTest binary; each test is a ctest entry.
function(wbt_add_test name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_DEPS} GTest::gtest GTest::gmock GTest::gtest_main
                                        Threads::Threads)
  target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/tests)
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST
                       PROPERTIES ENVIRONMENT "WBT_SOURCE_DIR=${PROJECT_SOURCE_DIR}")
endfunction()

# wbt_add_concurrency_test(NAME SOURCES ... [DEPS ...] [FILTER pattern]): tests where threads
# really meet. Their sources run in their area's binary in every build; under WBT_TSAN they also
# make a binary of their own, labelled "concurrency" and built by the target concurrency_tests,
# so that the ThreadSanitizer tree builds and runs only them. FILTER picks the tests of a source
# that holds other tests too.
function(wbt_add_concurrency_test name)
  if(NOT WBT_TSAN)
    return()
  endif()
  cmake_parse_arguments(ARG "" "FILTER" "SOURCES;DEPS" ${ARGN})
  if(NOT ARG_FILTER)
    set(ARG_FILTER "*")
  endif()
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_DEPS} GTest::gtest GTest::gmock GTest::gtest_main
                                        Threads::Threads)
  target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/tests)
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST TEST_FILTER ${ARG_FILTER}
                       PROPERTIES LABELS concurrency
                                  ENVIRONMENT "WBT_SOURCE_DIR=${PROJECT_SOURCE_DIR}")
  if(NOT TARGET concurrency_tests)
    add_custom_target(concurrency_tests)
  endif()
  add_dependencies(concurrency_tests ${name})
endfunction()

# wbt_add_bench(NAME SOURCES ... [DEPS ...]): one Google Benchmark program (not a test).
function(wbt_add_bench name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_DEPS} benchmark::benchmark benchmark::benchmark_main)
endfunction()

# wbt_add_fuzzer(NAME SOURCES ... [DEPS ...]): a libFuzzer target defining
# LLVMFuzzerTestOneInput. With WBT_FUZZ it links libFuzzer and ctest runs it for
# WBT_FUZZ_SECONDS from its seed corpus fuzz/corpus/NAME; without it, a small driver replays the
# seed corpus so every build still checks that the seeds pass.
function(wbt_add_fuzzer name)
  cmake_parse_arguments(ARG "" "" "SOURCES;DEPS" ${ARGN})
  set(corpus ${PROJECT_SOURCE_DIR}/fuzz/corpus/${name})
  if(WBT_FUZZ)
    add_executable(${name} ${ARG_SOURCES})
    target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/fuzz)
    target_link_libraries(${name} PRIVATE ${ARG_DEPS})
    target_link_options(${name} PRIVATE -fsanitize=fuzzer)
    add_test(NAME fuzz.${name}
             COMMAND ${PROJECT_SOURCE_DIR}/cmake/run_fuzzer.sh $<TARGET_FILE:${name}>
                     ${corpus} ${CMAKE_CURRENT_BINARY_DIR}/${name}.scratch ${WBT_FUZZ_SECONDS})
  else()
    add_executable(${name} ${ARG_SOURCES} ${PROJECT_SOURCE_DIR}/fuzz/ReplayMain.cpp)
    target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/fuzz)
    target_link_libraries(${name} PRIVATE ${ARG_DEPS})
    add_test(NAME replay.${name} COMMAND ${name} ${corpus})
  endif()
endfunction()

# wbt_link_host_runtime(TARGET): makes the executable TARGET a host process: it carries every
# function of the embedded host runtime (whole archive, so nothing unused is dropped) and exports
# them with "gWBRTVersion", so modules and the binding find the runtime in the main executable.
function(wbt_link_host_runtime target)
  target_link_libraries(${target} PRIVATE "$<LINK_LIBRARY:WHOLE_ARCHIVE,wbhost_runtime>")
  set_target_properties(${target} PROPERTIES ENABLE_EXPORTS ON)
endfunction()
