# hv_program_resources(PROGRAM SCRIPT.rc): PROGRAM carries what resources/SCRIPT.rc lists. On Windows alone: elsewhere
# programs have no resources, and the platform's door hands out the files of that folder by itself.
function(hv_program_resources program script)
    if(NOT WIN32)
        return()
    endif()
    set(folder ${CMAKE_SOURCE_DIR}/resources)
    target_sources(${program} PRIVATE ${folder}/${script})
    # The resource compiler does not say what a script reads, so everything in the folder counts.
    file(GLOB carried CONFIGURE_DEPENDS ${folder}/*.ico ${folder}/*.bmp ${folder}/*.xml ${folder}/*.rtf ${folder}/*.rch)
    string(REPLACE "." "," numbers ${PROJECT_VERSION})
    set_source_files_properties(${folder}/${script} PROPERTIES
        OBJECT_DEPENDS "${carried}"
        COMPILE_DEFINITIONS "HV_VERSION=${PROJECT_VERSION};HV_VERSION_NUMBERS=${numbers},0"
    )
endfunction()
