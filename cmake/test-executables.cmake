# Windows executables that tests read and nobody runs. The cross tools make them, whatever the target is.

find_program(HV_CROSS_COMPILER x86_64-w64-mingw32-gcc REQUIRED)
find_program(HV_CROSS_WINDRES x86_64-w64-mingw32-windres REQUIRED)

# hv_test_executable(TEST NAME SOURCE file.c [RESOURCE file.rc DEFINES name=value...]): before the test program TEST is
# built, NAME.exe stands in the folder that it knows as HV_TEST_EXECUTABLES.
function(hv_test_executable test name)
    cmake_parse_arguments(ARG "" "SOURCE;RESOURCE" "DEFINES" ${ARGN})
    hv_refuse_leftovers(hv_test_executable ${name} "${ARG_UNPARSED_ARGUMENTS}")
    set(folder ${CMAKE_CURRENT_BINARY_DIR}/executables)
    file(MAKE_DIRECTORY ${folder})
    set(program ${folder}/${name}.exe)
    set(source ${CMAKE_CURRENT_SOURCE_DIR}/${ARG_SOURCE})
    set(resource)
    set(compile_resource)
    if(ARG_RESOURCE)
        set(resource ${CMAKE_CURRENT_SOURCE_DIR}/${ARG_RESOURCE})
        set(object ${folder}/${name}.resource.o)
        list(TRANSFORM ARG_DEFINES PREPEND "--define=")
        set(compile_resource COMMAND ${HV_CROSS_WINDRES} --output-format=coff ${ARG_DEFINES} ${resource} ${object})
    endif()
    add_custom_command(
        OUTPUT ${program}
        ${compile_resource}
        COMMAND ${HV_CROSS_COMPILER} -nostdlib -s -Wl,--entry=Start,--no-insert-timestamp ${source} ${object} -o ${program}
        DEPENDS ${source} ${resource}
        COMMENT "Making ${name}.exe for ${test}"
        VERBATIM
    )
    add_custom_target(${test}_${name} DEPENDS ${program})
    add_dependencies(${test} ${test}_${name})
    target_compile_definitions(${test} PRIVATE HV_TEST_EXECUTABLES="${folder}")
endfunction()
