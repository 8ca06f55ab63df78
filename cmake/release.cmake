# The packages of a release, and the table by which its programs know them (package/ValidationTable.h).

# hvpack packs while the house is built, so it runs on this system, whatever the house is built for. A cross build makes
# one for itself: that of the hosted preset may be missing, or older than the sources.
if(CMAKE_CROSSCOMPILING)
    set(native ${CMAKE_BINARY_DIR}/native)
    set(HV_PACKER ${native}/bin/hvpack)
    add_custom_command(
        OUTPUT ${native}/build.ninja
        COMMAND ${CMAKE_COMMAND} -S ${CMAKE_SOURCE_DIR} -B ${native} --preset hosted
        WORKING_DIRECTORY ${CMAKE_SOURCE_DIR}
        COMMENT "Configuring hvpack for this system"
        VERBATIM
    )
    # That build knows by itself when there is nothing to do, so it is asked every time.
    add_custom_target(hv_packer
        COMMAND ${CMAKE_COMMAND} --build ${native} --target hvpack -- --quiet
        DEPENDS ${native}/build.ninja
        BYPRODUCTS ${HV_PACKER}
        COMMENT "Building hvpack for this system"
        VERBATIM
    )
    set(HV_PACKER_DEPENDS hv_packer ${HV_PACKER})
else()
    set(HV_PACKER $<TARGET_FILE:hvpack>)
    set(HV_PACKER_DEPENDS hvpack)
endif()

# hv_release(PACKAGES_VARIABLE SUITE folder): packs the sources in SUITE into `folder`, which is replaced whole, and sets
# the variable to the files that come to lie there.
function(hv_release files_variable suite folder)
    if(NOT EXISTS ${suite}/suite.json)
        message(FATAL_ERROR "There is no suite.json in ${suite}: the sources of a release are a folder for each package, and suite.json")
    endif()
    set(script ${CMAKE_SOURCE_DIR}/scripts/make-sample-release)
    file(GLOB_RECURSE sources CONFIGURE_DEPENDS ${suite}/*)
    file(GLOB manifests CONFIGURE_DEPENDS ${suite}/*/_hvmanifest.xml)
    set(files ${folder}/suite.json)
    foreach(manifest IN LISTS manifests)
        cmake_path(GET manifest PARENT_PATH package)
        cmake_path(GET package FILENAME package)
        list(APPEND files ${folder}/${package}.zip)
    endforeach()
    # A source that is taken away makes no other one newer; it changes this list.
    set(list ${CMAKE_CURRENT_BINARY_DIR}/sources.txt)
    file(CONFIGURE OUTPUT ${list} CONTENT "${sources}" @ONLY)
    add_custom_command(
        OUTPUT ${files}
        COMMAND ${script} ${folder} ${HV_PACKER} ${suite}
        DEPENDS ${sources} ${list} ${script} ${HV_PACKER_DEPENDS}
        COMMENT "Packing the release"
        VERBATIM
    )
    set(${files_variable} ${files} PARENT_SCOPE)
endfunction()

# hv_validation_rows(NAME PACKAGES folder DEPENDS file...): the object library NAME, with a row for each package of
# `folder`, made when the build comes to it. A program links it directly, not through a room: its object is then part of
# the program before any archive is searched, and the empty table of package/ValidationRows.cpp stays in its archive.
function(hv_validation_rows name)
    cmake_parse_arguments(ARG "" "PACKAGES" "DEPENDS" ${ARGN})
    hv_refuse_leftovers(hv_validation_rows ${name} "${ARG_UNPARSED_ARGUMENTS}")
    set(source ${CMAKE_CURRENT_BINARY_DIR}/${name}.cpp)
    # Reading packages needs a machine no more than any other file work; its own keeps the user's machine out of it.
    add_custom_command(
        OUTPUT ${source}
        COMMAND ${CMAKE_COMMAND} -E env HV_MACHINE=${CMAKE_CURRENT_BINARY_DIR}/machine
            ${HV_PACKER} table ${ARG_PACKAGES} ${source}
        DEPENDS ${ARG_DEPENDS} ${HV_PACKER_DEPENDS}
        COMMENT "Writing the validation table ${name}"
        VERBATIM
    )
    add_library(${name} OBJECT ${source})
    target_link_libraries(${name} PRIVATE hv_flags)
endfunction()
