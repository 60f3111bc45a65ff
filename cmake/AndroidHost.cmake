# Debian's builds of the Android platform libraries, as imported targets android::base, android::log
# and android::utils.

find_path(ANDROID_INCLUDE_DIR utils/RefBase.h PATHS /usr/include/android NO_DEFAULT_PATH REQUIRED)
find_program(HIDL_GEN hidl-gen REQUIRED)

foreach(library base cutils log utils)
    # They are in a folder of their own, which the linker and the loader do not search by default.
    find_library(ANDROID_LIB_${library} ${library} PATH_SUFFIXES android REQUIRED)
    add_library(android::${library} UNKNOWN IMPORTED)
    set_target_properties(
        android::${library}
        PROPERTIES IMPORTED_LOCATION ${ANDROID_LIB_${library}}
                   INTERFACE_INCLUDE_DIRECTORIES ${ANDROID_INCLUDE_DIR}
    )
endforeach()
target_link_libraries(android::utils INTERFACE android::cutils android::log)
