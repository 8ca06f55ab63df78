# Other people's libraries, all under the names third::*, so that rooms do not know where a target's libraries come from.
# Native libraries are the distribution's; those for Windows are built from the same distribution's sources.

set(THREADS_PREFER_PTHREAD_FLAG ON)
find_package(Threads REQUIRED)

function(hv_third_party name)
    cmake_parse_arguments(ARG "" "" "INCLUDES;LINKS;DEFINES" ${ARGN})
    add_library(third_${name} INTERFACE IMPORTED GLOBAL)
    target_include_directories(third_${name} INTERFACE ${ARG_INCLUDES})
    target_link_libraries(third_${name} INTERFACE ${ARG_LINKS})
    target_compile_definitions(third_${name} INTERFACE ${ARG_DEFINES})
    add_library(third::${name} ALIAS third_${name})
endfunction()

if(WIN32)
    include(third-party-windows)
else()
    include(third-party-native)
endif()

# The distribution ships GoogleTest's sources: one version for both targets.
set(INSTALL_GTEST OFF)
add_subdirectory(/usr/src/googletest ${CMAKE_BINARY_DIR}/googletest EXCLUDE_FROM_ALL SYSTEM)
hv_third_party(gtest LINKS gmock)
hv_third_party(gtest_main LINKS gmock_main)
