set(ROOM_WARNINGS -Wall -Wextra -Werror)

# read_once(<name> <target> <header>...): the compiler reads these headers once for all that name the same
# <name>. The preset "clang" goes without, and so shows an #include that is missing.
function(read_once name target)
    if(NOT TARGET ${name})
        file(GENERATE OUTPUT ${PROJECT_BINARY_DIR}/${name}.cpp CONTENT "")
        add_library(${name} OBJECT ${PROJECT_BINARY_DIR}/${name}.cpp)
        get_target_property(options ${target} COMPILE_OPTIONS)
        target_compile_options(${name} PRIVATE ${options})
        target_precompile_headers(${name} PRIVATE ${ARGN})
    endif()
    target_precompile_headers(${target} REUSE_FROM ${name})
endfunction()

set(ROOM_HEADERS
    <algorithm>
    <chrono>
    <functional>
    <map>
    <memory>
    <mutex>
    <optional>
    <set>
    <sstream>
    <string>
    <thread>
    <utility>
    <vector>
)

# room(<name> SOURCES <files>... DEPENDS <targets>...): a folder of this project as a static library.
# What it links is what it may include; includes are written from the project's root.
function(room name)
    cmake_parse_arguments(ROOM "" "" "SOURCES;DEPENDS" ${ARGN})
    add_library(${name} STATIC ${ROOM_SOURCES})
    target_compile_options(${name} PRIVATE ${ROOM_WARNINGS})
    read_once(room-headers ${name} ${ROOM_HEADERS})
    target_include_directories(${name} PUBLIC ${PROJECT_SOURCE_DIR})
    target_link_libraries(${name} PUBLIC ${ROOM_DEPENDS})
endfunction()

# program(<name> [STANDALONE] SOURCES <files>... DEPENDS <targets>...): an executable under the same
# rules. One that needs none of the platform's C++ libraries is STANDALONE; the others are only objects
# where OTHER_CXX_LIBRARY is set.
function(program name)
    cmake_parse_arguments(PROGRAM "STANDALONE" "" "SOURCES;DEPENDS" ${ARGN})
    if(OTHER_CXX_LIBRARY AND NOT PROGRAM_STANDALONE)
        add_library(${name} OBJECT ${PROGRAM_SOURCES})
    else()
        add_executable(${name} ${PROGRAM_SOURCES})
    endif()
    target_compile_options(${name} PRIVATE ${ROOM_WARNINGS})
    target_link_libraries(${name} PRIVATE ${PROGRAM_DEPENDS} ${EVERY_PROGRAM_DEPENDS})
endfunction()

# test_program(<name> [STANDALONE] SOURCES <files>... DEPENDS <targets>...): a program of GoogleTest
# cases. Its own code need not be fast but quick to build; OPTIMISE_TESTS is for warnings that g++ gives
# only where it optimises.
function(test_program name)
    program(${name} ${ARGN})
    if(OPTIMISE_TESTS)
        target_compile_options(${name} PRIVATE -O1)
    else()
        target_compile_options(${name} PRIVATE -O0)
    endif()
    target_link_libraries(${name} PRIVATE GTest::gmock)
    read_once(test-headers ${name} <gmock/gmock.h>)
    target_link_libraries(test-headers PRIVATE GTest::gmock)
endfunction()

# unit_test(...): the same, run as one test. GTEST_FILTER in the environment chooses among its cases.
function(unit_test name)
    test_program(${name} ${ARGN})
    math(EXPR timeout "300 * ${TIMEOUT_FACTOR}")
    target_link_libraries(${name} PRIVATE GTest::gmock_main)
    get_target_property(type ${name} TYPE)
    if(type STREQUAL EXECUTABLE)
        add_test(NAME ${name} COMMAND ${name} --gtest_brief=1)
        set_tests_properties(${name} PROPERTIES TIMEOUT ${timeout})
    endif()
endfunction()

# process_test(<name> <file>... [COST <seconds>] [TIMEOUT <seconds>] [ENVIRONMENT <NAME=value>...]):
# pytest files that drive whole programs. Left out where there are none that this machine runs as they
# stand. CTest starts first what has the highest COST.
function(process_test name)
    if(OTHER_CXX_LIBRARY OR CMAKE_CROSSCOMPILING)
        return()
    endif()
    cmake_parse_arguments(TEST "" "COST;TIMEOUT" "ENVIRONMENT" ${ARGN})
    if(NOT TEST_TIMEOUT)
        set(TEST_TIMEOUT 900)
    endif()
    if(NOT TEST_COST)
        set(TEST_COST 10)
    endif()
    math(EXPR TEST_TIMEOUT "${TEST_TIMEOUT} * ${TIMEOUT_FACTOR}")
    list(TRANSFORM TEST_UNPARSED_ARGUMENTS PREPEND ${CMAKE_CURRENT_SOURCE_DIR}/)
    # Its folders belong in the build, not in /tmp.
    file(MAKE_DIRECTORY ${PROJECT_BINARY_DIR}/pytest)
    list(APPEND TEST_ENVIRONMENT PYTEST_DEBUG_TEMPROOT=${PROJECT_BINARY_DIR}/pytest)
    add_test(NAME ${name} COMMAND /usr/bin/python3 -B -m pytest -q -p no:cacheprovider
                                  ${TEST_UNPARSED_ARGUMENTS}
    )
    set_tests_properties(
        ${name} PROPERTIES ENVIRONMENT "${TEST_ENVIRONMENT}" TIMEOUT ${TEST_TIMEOUT} COST ${TEST_COST}
    )
endfunction()

# process_tests(<folder> [ENVIRONMENT <NAME=value>...] [FIRST <name>...]): every test_*.py of a folder as
# a test of its own, <folder>.<name>, so that they run beside each other; without the ones called
# test_faults_*. FIRST are long ones, which would run on alone if they were the last.
function(process_tests folder)
    cmake_parse_arguments(TESTS "" "" "FIRST" ${ARGN})
    file(GLOB files CONFIGURE_DEPENDS RELATIVE ${CMAKE_CURRENT_SOURCE_DIR} ${folder}/test_*.py)
    list(FILTER files EXCLUDE REGEX "/test_faults_")
    foreach(file ${files})
        string(REGEX REPLACE ".*/test_(.*)\\.py" "\\1" name ${file})
        set(cost 30)
        if(name IN_LIST TESTS_FIRST)
            set(cost 80)
        endif()
        process_test(${folder}.${name} ${file} COST ${cost} ${TESTS_UNPARSED_ARGUMENTS})
    endforeach()
endfunction()
