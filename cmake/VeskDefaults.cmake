# SPDX-License-Identifier: Apache-2.0
# Language level, strict Qt definitions, warnings, sanitizers and output directories, for every target.
include(GNUInstallDirs)

set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_AUTOMOC ON)
set(CMAKE_AUTORCC ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/lib")

option(VESK_WERROR "Treat warnings as errors" OFF)
option(VESK_SANITIZE "Build with the address and undefined-behaviour sanitizers" OFF)
option(VESK_WITH_FUZZERS "Build the fuzz targets for libFuzzer (needs clang)" OFF)

find_package(Qt5 5.15 REQUIRED COMPONENTS Core Gui Widgets DBus Test)

add_compile_definitions(
    QT_NO_CAST_FROM_ASCII QT_NO_CAST_TO_ASCII QT_NO_CAST_FROM_BYTEARRAY QT_NO_URL_CAST_FROM_STRING
    QT_NO_KEYWORDS QT_NO_FOREACH QT_NO_NARROWING_CONVERSIONS_IN_CONNECT
    QT_DEPRECATED_WARNINGS QT_MESSAGELOGCONTEXT)

add_compile_options(-Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual
                    -Wcast-align -Wconversion -Wno-sign-conversion -Wformat=2)
# Where it optimises more, the compiler sees null pointers in other people's headers.
add_compile_options($<$<CONFIG:Debug>:-Wnull-dereference>)
if(VESK_WERROR)
    add_compile_options(-Werror)
endif()
if(VESK_SANITIZE)
    add_compile_options(-fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer -O1)
    add_link_options(-fsanitize=address,undefined)
endif()
if(VESK_WITH_FUZZERS)
    add_compile_options(-fsanitize=fuzzer-no-link)
endif()
