# SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
# SPDX-License-Identifier: LGPL-2.1-or-later
#
# What every target of the project is built with, and how a test is registered.

add_library(kavell_options INTERFACE)
target_compile_options(kavell_options INTERFACE -Wall -Wextra
                       "$<$<BOOL:${KAVELL_WARNINGS_AS_ERRORS}>:-Werror>" -Wshadow
                       "$<$<COMPILE_LANGUAGE:CXX>:-Wnon-virtual-dtor>"
                       "$<$<COMPILE_LANGUAGE:CXX>:-Woverloaded-virtual>"
                       "$<$<CXX_COMPILER_ID:GNU>:-fno-semantic-interposition>")
target_include_directories(kavell_options INTERFACE "$<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/include>"
                           "$<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}>")
target_link_options(kavell_options INTERFACE -Wl,--as-needed)
if(KAVELL_SANITIZE)
    target_compile_options(kavell_options INTERFACE -fsanitize=${KAVELL_SANITIZE} -fno-omit-frame-pointer
                           -fno-sanitize-recover=all)
    target_link_options(kavell_options INTERFACE -fsanitize=${KAVELL_SANITIZE})
    # What the sanitizers insert keeps g++ 12 from seeing that an empty std::optional is not read. The plain builds warn.
    target_compile_options(kavell_options INTERFACE "$<$<CXX_COMPILER_ID:GNU>:-Wno-maybe-uninitialized>")
endif()

if(KAVELL_BUILD_FUZZERS)
    target_compile_options(kavell_options INTERFACE -fsanitize=fuzzer-no-link)
endif()

# kavell_add_test(NAME SOURCES file… [LIBRARIES target…] [TIMEOUT seconds] [LABELS label…] [SHARED])
#
# A GoogleTest program, run by ctest in a scratch home with its own XDG directories, session bus and IPC namespace. It is
# linked with the library's objects, so that it sees internals; SHARED links the shared library as a client would.
function(kavell_add_test name)
    cmake_parse_arguments(ARG "SHARED" "TIMEOUT" "SOURCES;LIBRARIES;LABELS" ${ARGN})
    add_executable(${name} ${ARG_SOURCES})
    if(ARG_SHARED)
        target_link_libraries(${name} PRIVATE kavellstore)
    else()
        target_link_libraries(${name} PRIVATE kavellstore_internal)
    endif()
    target_link_libraries(${name} PRIVATE kavell_options kavell_test_support ${ARG_LIBRARIES} GTest::gtest_main
                          GTest::gmock)
    set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY "${PROJECT_BINARY_DIR}/tests")
    kavell_register_test(${name} COMMAND $<TARGET_FILE:${name}> TIMEOUT "${ARG_TIMEOUT}" LABELS ${ARG_LABELS})
endfunction()

# kavell_register_test(NAME COMMAND word… [TIMEOUT seconds] [LABELS label…]): any command, isolated in the same way.
function(kavell_register_test name)
    cmake_parse_arguments(ARG "" "TIMEOUT" "COMMAND;LABELS" ${ARGN})
    if(NOT ARG_TIMEOUT)
        set(ARG_TIMEOUT 120)
    endif()
    if(NOT ARG_LABELS)
        set(ARG_LABELS unit)
    endif()
    # The thread sanitizer's own exits: forked children of threaded tests may start threads, and no test waits a second to end.
    add_test(NAME ${name} COMMAND "${PROJECT_SOURCE_DIR}/tests/support/run_isolated" ${ARG_COMMAND})
    set_tests_properties(${name} PROPERTIES TIMEOUT "${ARG_TIMEOUT}" LABELS "${ARG_LABELS}" ENVIRONMENT
        "KAVELL_SOURCE_DIR=${PROJECT_SOURCE_DIR};KAVELL_BUILD_DIR=${PROJECT_BINARY_DIR};LSAN_OPTIONS=print_suppressions=0:suppressions=${PROJECT_SOURCE_DIR}/tests/support/lsan.supp;TSAN_OPTIONS=halt_on_error=1 die_after_fork=0 atexit_sleep_ms=20 suppressions=${PROJECT_SOURCE_DIR}/tests/support/tsan.supp")
endfunction()

# kavell_add_object_layer_library(NAME file…)
#
# One folder of libkavellaccounts, as objects with moc run over its sources. The public headers with Q_OBJECT are listed
# by the folder that implements them.
function(kavell_add_object_layer_library name)
    add_library(${name} OBJECT ${ARGN})
    set_target_properties(${name} PROPERTIES AUTOMOC ON)
    target_link_libraries(${name} PUBLIC kavell_options kavellstore Qt6::Core Qt6::Gui Qt6::Widgets)
    target_compile_definitions(${name} PRIVATE QT_NO_CAST_TO_ASCII QT_NO_FOREACH)
endfunction()

# kavell_add_object_layer_test(NAME SOURCES file… [LIBRARIES target…] [TIMEOUT seconds] [LABELS label…]
#                              [INTERNAL | WITH_ONLINE_SERVICE])
#
# A GoogleTest program for the object layer, isolated like all others and drawing offscreen. It links the shared library
# as a client does, so that plug-in bundles share its classes; INTERNAL links the library's objects instead, for tests
# that look at what is not exported and load no bundle. WITH_ONLINE_SERVICE runs it with the build of the library that
# knows the tests' own online service.
function(kavell_add_object_layer_test name)
    cmake_parse_arguments(ARG "INTERNAL;WITH_ONLINE_SERVICE" "TIMEOUT" "SOURCES;LIBRARIES;LABELS" ${ARGN})
    add_executable(${name} ${ARG_SOURCES})
    set_target_properties(${name} PROPERTIES AUTOMOC ON RUNTIME_OUTPUT_DIRECTORY "${PROJECT_BINARY_DIR}/tests")
    if(ARG_INTERNAL)
        target_link_libraries(${name} PRIVATE kavellaccounts_internal)
    else()
        target_link_libraries(${name} PRIVATE kavellaccounts)
    endif()
    target_link_libraries(${name} PRIVATE kavell_options kavell_object_layer_test_support ${ARG_LIBRARIES} GTest::gtest
                          GTest::gmock)
    set(command $<TARGET_FILE:${name}>)
    if(ARG_WITH_ONLINE_SERVICE)
        # The two builds of the library have one name, and this variable is searched before a program's own path.
        list(PREPEND command env "LD_LIBRARY_PATH=$<TARGET_FILE_DIR:kavellaccounts_with_online_service>")
        add_dependencies(${name} kavellaccounts_with_online_service)
    endif()
    kavell_register_test(${name} COMMAND ${command} TIMEOUT "${ARG_TIMEOUT}" LABELS ${ARG_LABELS})
endfunction()
