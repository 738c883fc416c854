# SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
# SPDX-License-Identifier: LGPL-2.1-or-later
#
# Building plug-in bundles. Included by the project itself and by the installed package; docs/plugins.md says what a
# bundle holds.

# kavell_compile_strings(SOURCE.ts RESULT.qm): a string table whose texts are looked up by their ids.
function(kavell_compile_strings source result)
    get_filename_component(source "${source}" ABSOLUTE)
    # Asked for here: a project without string tables needs no tool for them.
    if(NOT TARGET Qt6::lrelease)
        find_package(Qt6 REQUIRED COMPONENTS LinguistTools)
    endif()
    add_custom_command(OUTPUT "${result}" DEPENDS "${source}" VERBATIM
                       COMMAND Qt6::lrelease -silent -idbased "${source}" -qm "${result}")
endfunction()

# kavell_add_plugin(NAME IDENTIFIER id PRINCIPAL_CLASS class [VERSION 1] [BUNDLE_NAME name] [ICON_FILE file]
#                   SOURCES file… [RESOURCES file…] [STRINGS Localizable_en.ts…] [INFO_STRINGS InfoPlist_en.ts…]
#                   [OUTPUT_DIRECTORY directory])
#
# The bundle NAME.kaplugin in the output directory (the current binary directory by default), whose code is the target
# NAME. String sources must end in _LANGUAGE.ts; their own first part does not matter.
function(kavell_add_plugin name)
    cmake_parse_arguments(ARG "" "IDENTIFIER;PRINCIPAL_CLASS;VERSION;BUNDLE_NAME;ICON_FILE;OUTPUT_DIRECTORY"
                          "SOURCES;RESOURCES;STRINGS;INFO_STRINGS" ${ARGN})
    foreach(required IDENTIFIER PRINCIPAL_CLASS SOURCES)
        if(NOT ARG_${required})
            message(FATAL_ERROR "kavell_add_plugin(${name}): ${required} is missing")
        endif()
    endforeach()
    if(ARG_UNPARSED_ARGUMENTS)
        message(FATAL_ERROR "kavell_add_plugin(${name}): what is ${ARG_UNPARSED_ARGUMENTS}?")
    endif()
    if(NOT DEFINED ARG_VERSION)
        set(ARG_VERSION 1)
    endif()
    if(NOT ARG_OUTPUT_DIRECTORY)
        set(ARG_OUTPUT_DIRECTORY "${CMAKE_CURRENT_BINARY_DIR}")
    endif()
    set(contents "${ARG_OUTPUT_DIRECTORY}/${name}.kaplugin/Contents")

    _kavell_write_information_dictionary("${contents}/Info.plist" KABundleIdentifier "${ARG_IDENTIFIER}"
        KABundleName "${ARG_BUNDLE_NAME}" KABundleExecutable "lib${name}.so"
        KABundlePrincipalClass "${ARG_PRINCIPAL_CLASS}" KABundleIconFile "${ARG_ICON_FILE}"
        KAPluginVersion "${ARG_VERSION}")

    add_library(${name} MODULE ${ARG_SOURCES})
    set_target_properties(${name} PROPERTIES AUTOMOC ON PREFIX lib SUFFIX .so OUTPUT_NAME "${name}"
                          LIBRARY_OUTPUT_DIRECTORY "${contents}/Linux-${CMAKE_SYSTEM_PROCESSOR}")
    if(TARGET kavellaccounts)
        target_link_libraries(${name} PRIVATE kavellaccounts)
    else()
        target_link_libraries(${name} PRIVATE KavellAccounts::kavellaccounts)
    endif()

    set(results)
    foreach(resource IN LISTS ARG_RESOURCES)
        get_filename_component(resource "${resource}" ABSOLUTE)
        get_filename_component(file "${resource}" NAME)
        add_custom_command(OUTPUT "${contents}/Resources/${file}" DEPENDS "${resource}" VERBATIM
                           COMMAND ${CMAKE_COMMAND} -E copy "${resource}" "${contents}/Resources/${file}")
        list(APPEND results "${contents}/Resources/${file}")
    endforeach()
    _kavell_add_string_tables("${contents}/Resources/Localizable" results ${ARG_STRINGS})
    _kavell_add_string_tables("${contents}/Resources/InfoPlist" results ${ARG_INFO_STRINGS})
    file(MAKE_DIRECTORY "${contents}/Resources")
    if(results)
        add_custom_target(${name}_resources DEPENDS ${results})
        add_dependencies(${name} ${name}_resources)
    endif()
endfunction()

# The tables STEM_LANGUAGE.qm of sources that end in _LANGUAGE.ts, appended to the list.
function(_kavell_add_string_tables stem list)
    foreach(source IN LISTS ARGN)
        get_filename_component(file "${source}" NAME)
        if(NOT file MATCHES "_([a-z][a-z][a-z]?(_[A-Z][a-z]+)?(_[A-Z][A-Z])?)\\.ts$")
            message(FATAL_ERROR "kavell_add_plugin: ${source} must end in _LANGUAGE.ts")
        endif()
        set(language "${CMAKE_MATCH_1}")
        kavell_compile_strings("${source}" "${stem}_${language}.qm")
        list(APPEND ${list} "${stem}_${language}.qm")
    endforeach()
    set(${list} "${${list}}" PARENT_SCOPE)
endfunction()

# An XML property list of keys and values; keys without a value are left out, whole numbers become integers. Written at
# configure time, and only when it changes, since a new time of change makes running programs read it again.
function(_kavell_write_information_dictionary path)
    set(entries)
    while(ARGN)
        list(POP_FRONT ARGN key value)
        if(value STREQUAL "")
            continue()
        endif()
        string(REPLACE "&" "&amp;" value "${value}")
        string(REPLACE "<" "&lt;" value "${value}")
        if(key STREQUAL KAPluginVersion AND value MATCHES "^-?[0-9]+$")
            string(APPEND entries "    <key>${key}</key>\n    <integer>${value}</integer>\n")
        else()
            string(APPEND entries "    <key>${key}</key>\n    <string>${value}</string>\n")
        endif()
    endwhile()
    file(CONFIGURE OUTPUT "${path}" @ONLY CONTENT "<?xml version=\"1.0\" encoding=\"UTF-8\"?>
<plist version=\"1.0\">
<dict>
@entries@</dict>
</plist>
")
endfunction()
