# Compilers run through ccache where there is one. Included before project(), which is when launchers take effect.
find_program(HV_CCACHE ccache)
if(HV_CCACHE)
    set(CMAKE_C_COMPILER_LAUNCHER ${HV_CCACHE})
    set(CMAKE_CXX_COMPILER_LAUNCHER ${HV_CCACHE})
endif()
