# SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
# SPDX-License-Identifier: LGPL-2.1-or-later
#
# Compiles each public header alone, as C11 (but for the C++ face and the object layer) and as C++20, with every warning an
# error, so that a client may include any one of them first. Run by ctest:
# cmake -DINCLUDE=… -DC_COMPILER=… -DCXX_COMPILER=… -DQT_INCLUDES=… -P.

file(GLOB headers RELATIVE "${INCLUDE}" "${INCLUDE}/kavellaccounts/*.h")
list(LENGTH headers count)
if(count LESS 18)
    message(FATAL_ERROR "found only ${count} headers in ${INCLUDE}")
endif()

function(compile_alone header)
    execute_process(COMMAND ${ARGN} -Wall -Wextra -Wpedantic -Werror -fsyntax-only "-I${INCLUDE}" -include "${header}" -
                    INPUT_FILE /dev/null RESULT_VARIABLE status ERROR_VARIABLE complaint)
    if(NOT status EQUAL 0)
        message(SEND_ERROR "${header} does not stand alone (${ARGN}):\n${complaint}")
    endif()
endfunction()

list(REMOVE_ITEM QT_INCLUDES /usr/include)  # as a system directory it would hide the compiler's own
list(REMOVE_DUPLICATES QT_INCLUDES)
list(TRANSFORM QT_INCLUDES PREPEND "-isystem" OUTPUT_VARIABLE qt_flags)
list(APPEND qt_flags -fPIC)

foreach(header IN LISTS headers)
    if(header MATCHES "/(KA|NBS)[^/]*$")
        compile_alone("${header}" "${CXX_COMPILER}" -x c++ -std=c++20 ${qt_flags})
        continue()
    endif()
    if(NOT header STREQUAL "kavellaccounts/Ref.h")
        compile_alone("${header}" "${C_COMPILER}" -x c -std=c11)
    endif()
    compile_alone("${header}" "${CXX_COMPILER}" -x c++ -std=c++20)
endforeach()
message(STATUS "${count} headers stand alone")
