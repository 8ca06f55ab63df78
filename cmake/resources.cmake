# hv_program_resources(PROGRAM SCRIPT.rc): PROGRAM carries what resources/SCRIPT.rc lists. On Windows the system's own
# compiler makes all of it part of the program; hosted it is the texts, which platform/hosted/program.h hands out.
function(hv_program_resources program script)
    set(folder ${CMAKE_SOURCE_DIR}/resources)
    # Neither compiler says what it reads, so everything in the folder counts.
    file(GLOB carried CONFIGURE_DEPENDS ${folder}/*.ico ${folder}/*.bmp ${folder}/*.xml ${folder}/*.rtf ${folder}/*.rch)
    if(WIN32)
        set(source ${folder}/${script})
    else()
        hv_hosted_resources(source ${folder}/${script})
    endif()
    string(REPLACE "." "," numbers ${PROJECT_VERSION})
    target_sources(${program} PRIVATE ${source})
    set_source_files_properties(${source} PROPERTIES
        OBJECT_DEPENDS "${carried}"
        COMPILE_DEFINITIONS "HV_VERSION=${PROJECT_VERSION};HV_VERSION_NUMBERS=${numbers},0"
    )
endfunction()

# hv_hosted_resources(RESULT SCRIPT): the name of a source with the listed resources of our own types. The script stays
# the one list: CMake reads its lines, and again when it changes.
function(hv_hosted_resources result script)
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${script})
    file(STRINGS ${script} lines REGEX "^[0-9]+ [A-Z_]+ \"")
    list(FILTER lines EXCLUDE REGEX "^[0-9]+ (ICON|BITMAP) ")
    list(TRANSFORM lines REPLACE "^([0-9]+) ([A-Z_]+) \"(.*)\".*$" "HV_RESOURCE(\\1, \"\\2\", \"${CMAKE_SOURCE_DIR}/\\3\")")
    list(JOIN lines "\n" HV_RESOURCES)
    get_filename_component(name ${script} NAME_WE)
    set(source ${CMAKE_BINARY_DIR}/resources/${name}.cpp)
    configure_file(${CMAKE_SOURCE_DIR}/cmake/hosted/resources.cpp.in ${source} @ONLY)
    set(${result} ${source} PARENT_SCOPE)
endfunction()
