# hidl_package(<target> PACKAGE <name@version> SOURCES <.hal>... GENERATED <headers and sources>...)
#
# Runs hidl-gen on a HIDL package at build time and builds its stubs and proxies as the static library
# <target>. GENERATED names what the package generates, below its own output folder. Soong does the
# same on a phone's build.

set(HIDL_ROOTS -r vendor.korvan.bex.wifi:${PROJECT_SOURCE_DIR}/interface -r
               android.hidl:${PROJECT_SOURCE_DIR}/host/hidl
)
set(HIDL_OUTPUT ${PROJECT_BINARY_DIR}/hidl)

# All that is generated, for a tool that reads the sources and builds nothing.
add_custom_target(generated)

function(hidl_package target)
    cmake_parse_arguments(HIDL "" "PACKAGE" "SOURCES;GENERATED" ${ARGN})
    string(REGEX REPLACE "[.@]" "/" folder ${HIDL_PACKAGE})
    # 1/0 -> 1.0: only the version keeps its dot in the path.
    string(REGEX REPLACE "/([0-9]+)/([0-9]+)$" "/\\1.\\2" folder ${folder})
    list(TRANSFORM HIDL_GENERATED PREPEND ${HIDL_OUTPUT}/${folder}/)
    set(headers ${HIDL_GENERATED})
    list(FILTER headers INCLUDE REGEX "\\.h$")

    # A variable template's specialisation is not implicitly inline, so two units that include the
    # header would both define it; hidl-gen's own compiler let that pass.
    add_custom_command(
        OUTPUT ${HIDL_GENERATED}
        COMMAND ${HIDL_GEN} -o ${HIDL_OUTPUT} -L c++-headers ${HIDL_ROOTS} ${HIDL_PACKAGE}
        COMMAND ${HIDL_GEN} -o ${HIDL_OUTPUT} -L c++-sources ${HIDL_ROOTS} ${HIDL_PACKAGE}
        COMMAND sed -i "s/^template<> constexpr/template<> inline constexpr/" ${headers}
        DEPENDS ${HIDL_SOURCES}
        COMMENT "Generating ${HIDL_PACKAGE}"
        VERBATIM
    )

    add_custom_target(${target}-generated DEPENDS ${HIDL_GENERATED})
    add_dependencies(generated ${target}-generated)
    add_library(${target} STATIC ${HIDL_GENERATED})
    # We cannot fix warnings in generated code: they come from hidl-gen.
    target_compile_options(${target} PRIVATE -w)
    target_include_directories(${target} SYSTEM PUBLIC ${HIDL_OUTPUT})
endfunction()
