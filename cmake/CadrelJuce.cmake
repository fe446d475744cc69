# SPDX-License-Identifier: GPL-3.0-or-later

# The JUCE modules, built once from Debian's juce-modules-source. Their headers are system headers, and their own code has none
# of our warnings.

find_path(CADREL_JUCE_MODULES juce_core/juce_core.h PATHS /usr/share/juce/modules NO_DEFAULT_PATH REQUIRED
    DOC "The folder of the JUCE modules")
find_package(Freetype REQUIRED)
find_package(JPEG REQUIRED)
find_package(PNG REQUIRED)
find_package(Threads REQUIRED)
find_package(ZLIB REQUIRED)

find_package(X11 REQUIRED COMPONENTS Xext Xinerama Xrandr Xcursor OPTIONAL_COMPONENTS Xtst)

# cadrel_juce_library(name MODULE module... [OPTIONS option...]): the modules, compiled with the options alone or, without any,
# as all else is.
function(cadrel_juce_library target)
    cmake_parse_arguments(PARSE_ARGV 1 ARG "" "" "MODULE;OPTIONS")
    set(sources)
    foreach(module IN LISTS ARG_MODULE)
        list(APPEND sources ${CADREL_JUCE_MODULES}/${module}/${module}.cpp)
    endforeach()
    add_library(${target} STATIC ${sources})
    target_include_directories(${target} SYSTEM PUBLIC ${CADREL_JUCE_MODULES})
    # What uses the modules has to see the same switches as they did.
    target_compile_definitions(${target} PUBLIC
        DONT_SET_USING_JUCE_NAMESPACE=1
        JUCE_DISABLE_JUCE_VERSION_PRINTING=1
        JUCE_GLOBAL_MODULE_SETTINGS_INCLUDED=1
        JUCE_STANDALONE_APPLICATION=0
        JUCE_USE_CURL=0
        $<IF:$<CONFIG:Debug>,_DEBUG=1,NDEBUG=1>
        # Its assertions say on stderr what is used wrongly.
        $<$<BOOL:${CADREL_SANITIZE}>:JUCE_LOG_ASSERTIONS=1>)
    foreach(module IN LISTS ARG_MODULE)
        target_compile_definitions(${target} PUBLIC JUCE_MODULE_AVAILABLE_${module}=1)
    endforeach()
    target_link_libraries(${target}
        PRIVATE Freetype::Freetype JPEG::JPEG PNG::PNG ZLIB::ZLIB
        PUBLIC Threads::Threads ${CMAKE_DL_LIBS})
    # A second JUCE in the process must not take the place of this one.
    set_target_properties(${target} PROPERTIES
        POSITION_INDEPENDENT_CODE ON CXX_VISIBILITY_PRESET hidden VISIBILITY_INLINES_HIDDEN ON)
    if(ARG_OPTIONS)
        set_target_properties(${target} PROPERTIES COMPILE_OPTIONS "${ARG_OPTIONS}")
    endif()
    if(CADREL_CCACHE)
        # A module holds the time of its compilation, and would never be found in the cache for it.
        set_target_properties(${target} PROPERTIES CXX_COMPILER_LAUNCHER
            "${CMAKE_COMMAND};-E;env;CCACHE_SLOPPINESS=time_macros;${CADREL_CCACHE}")
    endif()
endfunction()

# What pictures need, and what the window needs besides.
set(CADREL_JUCE_PICTURE_MODULES juce_core juce_events juce_graphics)
cadrel_juce_library(cadrel_juce
    MODULE ${CADREL_JUCE_PICTURE_MODULES} juce_data_structures juce_gui_basics)
