# What every Windows program gets besides its own sources: a manifest, and libraries that come from the system's folder
# alone. Elsewhere these functions do nothing.

# hv_delayed_library(NAME LIBRARY FUNCTION...): third::NAME is the system library LIBRARY, looked up when one of these
# functions is called first. What Windows does not keep loaded for everybody (the registry's KnownDLLs) is imported in
# this way: an ordinary import would be looked for in the program's own folder first by a loader that does not know the
# flags of platform/windows/library_search.cpp. A function that is missing here fails to link, or adds the library to
# the ordinary imports, which a test of the shipped programs refuses.
function(hv_delayed_library name library)
    set(stem ${CMAKE_BINARY_DIR}/delayed/${name})
    list(JOIN ARGN "\n" functions)
    file(CONFIGURE OUTPUT ${stem}.def CONTENT "LIBRARY ${library}\nEXPORTS\n${functions}\n" @ONLY)
    execute_process(
        COMMAND ${CMAKE_DLLTOOL} --input-def ${stem}.def --output-delaylib lib${name}-delayed.a
        WORKING_DIRECTORY ${CMAKE_BINARY_DIR}/delayed
        COMMAND_ERROR_IS_FATAL ANY
    )
    hv_third_party(${name} LINKS ${CMAKE_BINARY_DIR}/delayed/lib${name}-delayed.a)
endfunction()

# hv_complete_windows_program(PROGRAM LEVEL CODE_PAGE): LEVEL is what Windows asks for when the program starts, CODE_PAGE
# the manifest's element for narrow strings, or nothing.
function(hv_complete_windows_program program level code_page)
    if(NOT WIN32)
        return()
    endif()
    hv_add_manifest(${program} ${level} "${code_page}")
    hv_add_library_search(${program})
endfunction()

# hv_ships(PROGRAM): the linker leaves a map beside it (PROGRAM.exe.map), from which scripts/list-parts reads what went
# into it.
function(hv_ships program)
    if(WIN32)
        target_link_options(${program} PRIVATE LINKER:-Map,$<TARGET_FILE:${program}>.map)
    endif()
endfunction()

# Narrow strings are UTF-8, paths may be long, Windows 10 is meant.
function(hv_add_manifest program level code_page)
    set(HV_EXECUTION_LEVEL ${level})
    set(HV_CODE_PAGE "${code_page}")
    set(name ${level})
    if(code_page STREQUAL "")
        string(APPEND name -old-code-page)
    endif()
    set(manifest ${CMAKE_BINARY_DIR}/manifests/${name}.manifest)
    configure_file(${CMAKE_SOURCE_DIR}/cmake/windows/program.manifest.in ${manifest} @ONLY)
    set(HV_MANIFEST ${manifest})
    set(script ${CMAKE_BINARY_DIR}/manifests/${name}.rc)
    configure_file(${CMAKE_SOURCE_DIR}/cmake/windows/manifest.rc.in ${script} @ONLY)
    target_sources(${program} PRIVATE ${script})
    set_property(SOURCE ${script} PROPERTY OBJECT_DEPENDS ${manifest})
endfunction()

function(hv_add_library_search program)
    if(NOT TARGET hv_library_search)
        add_library(hv_library_search OBJECT ${CMAKE_SOURCE_DIR}/platform/windows/library_search.cpp)
        target_link_libraries(hv_library_search PRIVATE hv_flags)
        hv_add_finisher()
    endif()
    target_link_libraries(${program} PRIVATE hv_library_search)
    add_dependencies(${program} hv_finisher)
    add_custom_command(TARGET ${program} POST_BUILD COMMAND ${HV_FINISHER} $<TARGET_FILE:${program}> VERBATIM)
endfunction()

# It runs on this system, whose compiler the toolchain file does not name.
set(HV_FINISHER ${CMAKE_BINARY_DIR}/native-tools/finish_program)
function(hv_add_finisher)
    find_program(HV_NATIVE_COMPILER g++ REQUIRED)
    set(source ${CMAKE_SOURCE_DIR}/cmake/windows/finish_program.cpp)
    file(MAKE_DIRECTORY ${CMAKE_BINARY_DIR}/native-tools)
    add_custom_command(
        OUTPUT ${HV_FINISHER}
        COMMAND ${HV_NATIVE_COMPILER} -std=c++20 -O1 -Wall -Wextra -Wconversion -Wshadow -Werror ${source} -o ${HV_FINISHER}
        DEPENDS ${source}
        COMMENT "Building finish_program for this system"
        VERBATIM
    )
    add_custom_target(hv_finisher DEPENDS ${HV_FINISHER})
endfunction()
