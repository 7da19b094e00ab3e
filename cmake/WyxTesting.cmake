# Test helpers shared by every test folder.
#   wyx_unit_test(name SOURCES ... LIBS ...)  needs no display; also built under the sanitizers.
#   wyx_gui_test(name SOURCES ... LIBS ...)   needs a display (run the whole ctest under xvfb-run -a).
#   wyx_fuzz_target(name SOURCES ... LIBS ...) libFuzzer target, run briefly as a test (clang builds).
include(GoogleTest)
find_package(GTest REQUIRED)

set(WYX_FUZZ_SECONDS 10 CACHE STRING "How long each fuzz target runs as a test")

# GUI tests share one display, its pointer and its keyboard focus: they run one
# at a time (the unit tests still run beside them).
set(WYX_GUI_TEST_PROPERTIES LABELS gui RESOURCE_LOCK display TIMEOUT 300
    ENVIRONMENT NO_AT_BRIDGE=1)

function(wyx_unit_test name)
    cmake_parse_arguments(T "" "" "SOURCES;LIBS" ${ARGN})
    add_executable(${name} ${T_SOURCES})
    target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/tests/support)
    target_link_libraries(${name} PRIVATE ${T_LIBS} GTest::gtest GTest::gtest_main)
    gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST NO_PRETTY_VALUES PROPERTIES LABELS unit TIMEOUT 300)
endfunction()

function(wyx_gui_test name)
    if(NOT WYX_GUI)
        return()
    endif()
    cmake_parse_arguments(T "" "" "SOURCES;LIBS" ${ARGN})
    add_executable(${name} ${T_SOURCES} ${PROJECT_SOURCE_DIR}/tests/support/GuiTestMain.cpp)
    target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/tests/support)
    target_link_libraries(${name} PRIVATE ${T_LIBS} wx::core GTest::gtest)
    gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST NO_PRETTY_VALUES PROPERTIES ${WYX_GUI_TEST_PROPERTIES})
endfunction()

function(wyx_fuzz_target name)
    if(NOT WYX_FUZZ)
        return()
    endif()
    cmake_parse_arguments(T "" "" "SOURCES;LIBS" ${ARGN})
    add_executable(${name} ${T_SOURCES})
    target_compile_options(${name} PRIVATE -fsanitize=fuzzer)
    target_link_options(${name} PRIVATE -fsanitize=fuzzer)
    target_link_libraries(${name} PRIVATE ${T_LIBS})
    # The fuzzer adds what it finds to a copy of the seed corpus, never to the sources.
    set(seeds ${CMAKE_CURRENT_SOURCE_DIR}/corpus/${name})
    set(work ${CMAKE_CURRENT_BINARY_DIR}/corpus/${name})
    add_test(NAME ${name}
             COMMAND ${CMAKE_COMMAND} -E env ASAN_OPTIONS=detect_leaks=0
                     sh -c "mkdir -p '${work}' && { [ ! -d '${seeds}' ] || cp -r '${seeds}/.' '${work}/'; } && exec \"$0\" -max_total_time=${WYX_FUZZ_SECONDS} -timeout=10 -rss_limit_mb=2048 '${work}'"
                     $<TARGET_FILE:${name}>)
    set_tests_properties(${name} PROPERTIES LABELS fuzz TIMEOUT 600)
endfunction()
