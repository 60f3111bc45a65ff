# room(<name> SOURCES <files>... DEPENDS <targets>...): a folder of this project as a static library.
# What it links is what it may include; includes are written from the project's root.

set(ROOM_WARNINGS -Wall -Wextra -Werror)

function(room name)
    cmake_parse_arguments(ROOM "" "" "SOURCES;DEPENDS" ${ARGN})
    add_library(${name} STATIC ${ROOM_SOURCES})
    target_compile_options(${name} PRIVATE ${ROOM_WARNINGS})
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

# unit_test(<name> [STANDALONE] SOURCES <files>... DEPENDS <targets>...): a GoogleTest program, each
# test known to CTest by itself.
function(unit_test name)
    program(${name} ${ARGN})
    math(EXPR timeout "60 * ${TIMEOUT_FACTOR}")
    target_link_libraries(${name} PRIVATE GTest::gmock_main)
    get_target_property(type ${name} TYPE)
    if(type STREQUAL EXECUTABLE)
        gtest_discover_tests(
            ${name} TEST_PREFIX ${name}. DISCOVERY_MODE PRE_TEST PROPERTIES TIMEOUT ${timeout}
        )
    endif()
endfunction()

# process_test(<name> <file>... [TIMEOUT <seconds>] [ENVIRONMENT <NAME=value>...]): pytest files that
# drive whole programs. Left out where there are none that this machine runs as they stand.
function(process_test name)
    if(OTHER_CXX_LIBRARY OR CMAKE_CROSSCOMPILING)
        return()
    endif()
    cmake_parse_arguments(TEST "" "TIMEOUT" "ENVIRONMENT" ${ARGN})
    if(NOT TEST_TIMEOUT)
        set(TEST_TIMEOUT 900)
    endif()
    math(EXPR TEST_TIMEOUT "${TEST_TIMEOUT} * ${TIMEOUT_FACTOR}")
    list(TRANSFORM TEST_UNPARSED_ARGUMENTS PREPEND ${CMAKE_CURRENT_SOURCE_DIR}/)
    add_test(NAME ${name} COMMAND /usr/bin/python3 -B -m pytest -q -p no:cacheprovider
                                  ${TEST_UNPARSED_ARGUMENTS}
    )
    set_tests_properties(
        ${name} PROPERTIES ENVIRONMENT "${TEST_ENVIRONMENT}" TIMEOUT ${TEST_TIMEOUT}
    )
endfunction()
