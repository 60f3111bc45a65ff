# SANITIZE: empty, or what everything is built with, see tests/sanitizers/README.md.
#   address  AddressSanitizer, LeakSanitizer and UndefinedBehaviorSanitizer
#   thread   ThreadSanitizer
#
# TIMEOUT_FACTOR: how many times longer a test may take than without a sanitizer.

set(SANITIZE "" CACHE STRING "address or thread")
set(TIMEOUT_FACTOR 1)
if(SANITIZE STREQUAL address)
    set(SANITIZERS address,undefined)
    set(TIMEOUT_FACTOR 4)
elseif(SANITIZE STREQUAL thread)
    set(SANITIZERS thread)
    set(TIMEOUT_FACTOR 8)
elseif(SANITIZE)
    message(FATAL_ERROR "SANITIZE is '${SANITIZE}', neither address nor thread")
endif()

if(SANITIZE)
    # The instrumentation hides from g++ 12 that the standard library's own code sets what it reads.
    add_compile_options(
        -fsanitize=${SANITIZERS} -fno-sanitize-recover=all -fno-omit-frame-pointer -O1
        -Wno-maybe-uninitialized
    )
    add_link_options(-fsanitize=${SANITIZERS})

    # An object library: the runtimes find these functions in the program itself.
    add_library(sanitizer-options OBJECT ${PROJECT_SOURCE_DIR}/tests/sanitizers/Options.cpp)
    target_compile_options(sanitizer-options PRIVATE ${ROOM_WARNINGS} -fno-sanitize=all)
    if(SANITIZE STREQUAL thread)
        target_sources(sanitizer-options PRIVATE ${PROJECT_SOURCE_DIR}/tests/sanitizers/References.cpp)
        target_link_libraries(sanitizer-options PUBLIC android::utils ${CMAKE_DL_LIBS})
    endif()
    set(EVERY_PROGRAM_DEPENDS sanitizer-options)
endif()
