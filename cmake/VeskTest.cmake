# SPDX-License-Identifier: Apache-2.0
# vesk_add_test(NAME SOURCES file... [LIBS target...] [ISOLATED] [TIMEOUT seconds] [ENVIRONMENT name=value...])
#
# One QtTest executable, registered with ctest. Each test has a home, a runtime directory and a temporary directory of
# its own below the build directory, so that all of them can run at the same time. An ISOLATED test sees a fresh
# /etc/vesk, /usr/share/vesk, /tmp and /etc/hostname of its own and may write there.
# Quoted for the sanitizer, which takes a blank in the path for the end of the option. use_tls=0: the search for leaks reads
# wrong addresses, and so ends the program, where a thread of Qt is just letting go of its thread-local memory. A copy in
# the build, which isolated programs see even where the checkout is below /tmp.
configure_file("${PROJECT_SOURCE_DIR}/tests/leaks.supp" "${PROJECT_BINARY_DIR}/leaks.supp" COPYONLY)
set(VESK_SANITIZER_ENVIRONMENT
    "ASAN_OPTIONS=detect_stack_use_after_return=1;LSAN_OPTIONS=suppressions='${PROJECT_BINARY_DIR}/leaks.supp':print_suppressions=0:use_tls=0;UBSAN_OPTIONS=print_stacktrace=1")

function(vesk_add_test name)
    cmake_parse_arguments(ARG "ISOLATED" "TIMEOUT" "SOURCES;LIBS;ENVIRONMENT" ${ARGN})
    if(NOT ARG_TIMEOUT)
        set(ARG_TIMEOUT 120)
    endif()

    add_executable(${name} ${ARG_SOURCES})
    target_link_libraries(${name} PRIVATE Qt5::Test ${ARG_LIBS})
    set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/tests")

    set(private "${CMAKE_BINARY_DIR}/tests/private/${name}")
    foreach(directory home runtime tmp)
        file(MAKE_DIRECTORY "${private}/${directory}")
        file(CHMOD "${private}/${directory}" PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE)
    endforeach()

    if(ARG_ISOLATED)
        # A checkout below /tmp would be out of the test's sight.
        set(sources "${PROJECT_SOURCE_DIR}/tests")
        add_test(NAME ${name} COMMAND vesk-isolate --writable "${private}" --bind "${sources}:${sources}"
                                                   -- $<TARGET_FILE:${name}>)
    else()
        add_test(NAME ${name} COMMAND ${name})
    endif()
    set_tests_properties(${name} PROPERTIES
        TIMEOUT ${ARG_TIMEOUT}
        ENVIRONMENT "QT_QPA_PLATFORM=offscreen;LC_ALL=C.UTF-8;HOME=${private}/home;XDG_RUNTIME_DIR=${private}/runtime;TMPDIR=${private}/tmp;${VESK_SANITIZER_ENVIRONMENT};${ARG_ENVIRONMENT}")
endfunction()
