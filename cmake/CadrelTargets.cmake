# SPDX-License-Identifier: GPL-3.0-or-later

# What all targets of this tree share: the language, the warnings, the sanitizers and where the outputs go.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)
set(CMAKE_ARCHIVE_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/lib)

find_program(CADREL_CCACHE ccache)
if(CADREL_CCACHE)
    set(CMAKE_CXX_COMPILER_LAUNCHER ${CADREL_CCACHE})
endif()

if(CADREL_SANITIZE)
    set(sanitizers -fsanitize=address,undefined,float-cast-overflow)
    add_compile_options(${sanitizers} -fno-sanitize-recover=all -fno-omit-frame-pointer)
    add_compile_definitions(_GLIBCXX_ASSERTIONS)
    add_link_options(${sanitizers})
endif()
if(CADREL_BUILD_FUZZERS)
    add_compile_options(-fsanitize=fuzzer-no-link)
endif()

function(cadrel_warnings target)
    target_compile_options(${target} PRIVATE -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Werror)
endfunction()

# cadrel_sources(result FOLDER folder... [ONLY class... | EXCEPT class...]): the sources of the folders. With ONLY, those of the
# classes alone, and of their tests; with EXCEPT all others. So two targets can share a folder.
function(cadrel_sources result)
    cmake_parse_arguments(PARSE_ARGV 1 ARG "" "" "FOLDER;ONLY;EXCEPT")
    set(sources)
    foreach(folder IN LISTS ARG_FOLDER)
        file(GLOB found CONFIGURE_DEPENDS ${folder}/*.cpp ${folder}/*.h)
        list(APPEND sources ${found})
    endforeach()
    string(REPLACE ";" "|" classes "${ARG_ONLY}${ARG_EXCEPT}")
    if(ARG_ONLY)
        list(FILTER sources INCLUDE REGEX "/(${classes})(Test)?[.](cpp|h)$")
    elseif(ARG_EXCEPT)
        list(FILTER sources EXCLUDE REGEX "/(${classes})(Test)?[.](cpp|h)$")
    endif()
    set(${result} ${sources} PARENT_SCOPE)
endfunction()

# cadrel_library(name FOLDER folder... [ONLY class... | EXCEPT class...] [LINK library...]): a static library of the sources that
# cadrel_sources finds, which a module can link too, or an interface where there are headers alone.
function(cadrel_library target)
    cmake_parse_arguments(PARSE_ARGV 1 ARG "" "" "FOLDER;ONLY;EXCEPT;LINK")
    list(TRANSFORM ARG_FOLDER PREPEND ${PROJECT_SOURCE_DIR}/)
    cadrel_sources(sources FOLDER ${ARG_FOLDER} ONLY ${ARG_ONLY} EXCEPT ${ARG_EXCEPT})
    if(NOT sources MATCHES "[.]cpp")
        add_library(${target} INTERFACE ${sources})
        target_include_directories(${target} INTERFACE ${PROJECT_SOURCE_DIR}/src)
        target_link_libraries(${target} INTERFACE ${ARG_LINK})
        return()
    endif()
    add_library(${target} STATIC ${sources})
    target_include_directories(${target} PUBLIC ${PROJECT_SOURCE_DIR}/src)
    target_link_libraries(${target} PUBLIC ${ARG_LINK})
    set_target_properties(${target} PROPERTIES
        POSITION_INDEPENDENT_CODE ON CXX_VISIBILITY_PRESET hidden VISIBILITY_INLINES_HIDDEN ON)
    cadrel_warnings(${target})
endfunction()

# cadrel_embed(target variable file): puts the file into the target's data. It is declared as
# `namespace cadrel::embedded { extern const std::span<const unsigned char> Variable; }`.
function(cadrel_embed target variable file)
    set(source ${CMAKE_CURRENT_BINARY_DIR}/embedded/${variable}.cpp)
    add_custom_command(OUTPUT ${source}
        COMMAND ${CMAKE_COMMAND} -D VARIABLE=${variable} -D FILE=${PROJECT_SOURCE_DIR}/${file} -D SOURCE=${source}
            -P ${PROJECT_SOURCE_DIR}/cmake/EmbedFile.cmake
        DEPENDS ${PROJECT_SOURCE_DIR}/${file} ${PROJECT_SOURCE_DIR}/cmake/EmbedFile.cmake
        VERBATIM)
    target_sources(${target} PRIVATE ${source})
endfunction()

# cadrel_link_closure(result target): all that the target links, directly or by way of what it links.
function(cadrel_link_closure result target)
    set(closure)
    set(open ${target})
    while(open)
        list(POP_FRONT open next)
        if(next MATCHES "^[$]<LINK_ONLY:(.*)>$")
            set(next ${CMAKE_MATCH_1})
        endif()
        if(next IN_LIST closure)
            continue()
        endif()
        list(APPEND closure ${next})
        if(TARGET ${next})
            get_target_property(type ${next} TYPE)
            foreach(property LINK_LIBRARIES INTERFACE_LINK_LIBRARIES)
                if(property STREQUAL "LINK_LIBRARIES" AND type STREQUAL "INTERFACE_LIBRARY")
                    continue()
                endif()
                get_target_property(linked ${next} ${property})
                if(linked)
                    list(APPEND open ${linked})
                endif()
            endforeach()
        endif()
    endwhile()
    set(${result} ${closure} PARENT_SCOPE)
endfunction()
