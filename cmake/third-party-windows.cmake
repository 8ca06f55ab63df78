enable_language(RC)

# Makes them when they are not in the cache; one question otherwise.
execute_process(
    COMMAND ${CMAKE_SOURCE_DIR}/scripts/windows-libraries
    OUTPUT_VARIABLE made
    OUTPUT_STRIP_TRAILING_WHITESPACE
    COMMAND_ERROR_IS_FATAL ANY
)
set(include ${made}/include)
set(lib ${made}/lib)

# On the distribution's side of the fence: header and library of the cross-compiler itself.
hv_third_party(zlib LINKS z)

# Of the system's own, those that are loaded when they are called first, and what is called of them.
hv_delayed_library(bcrypt bcrypt.dll BCryptCloseAlgorithmProvider BCryptCreateHash
    BCryptDestroyHash BCryptFinishHash BCryptGenRandom BCryptHashData BCryptOpenAlgorithmProvider)
hv_delayed_library(comctl32 COMCTL32.dll InitCommonControlsEx)
# Windows keeps this one loaded, but it brings the common controls along, and these the look of windows.
hv_delayed_library(comdlg32 comdlg32.dll GetSaveFileNameW)
hv_delayed_library(version VERSION.dll GetFileVersionInfoA GetFileVersionInfoSizeA VerQueryValueA)

set(boost_defines BOOST_ALL_NO_LIB BOOST_FILESYSTEM_STATIC_LINK BOOST_THREAD_USE_LIB BOOST_CHRONO_STATIC_LINK)
hv_third_party(boost_filesystem INCLUDES ${include} DEFINES ${boost_defines}
    LINKS ${lib}/libboost_filesystem.a third::bcrypt ole32 oleaut32 uuid)
hv_third_party(boost_thread INCLUDES ${include} DEFINES ${boost_defines}
    LINKS ${lib}/libboost_thread.a ${lib}/libboost_chrono.a Threads::Threads third::bcrypt)

# The library is compiled with the same definitions; scripts/windows-libraries has its half.
hv_third_party(log4cpp INCLUDES ${include}
    DEFINES LOG4CPP_HAVE_INT64_T=1 LOG4CPP_HAVE_IN_ADDR_T=1 "in_addr_t=unsigned long"
    LINKS ${lib}/liblog4cpp.a ws2_32)

hv_third_party(tinyxml INCLUDES ${include} LINKS ${lib}/libtinyxml.a DEFINES TIXML_USE_STL)
hv_third_party(minizip INCLUDES ${include} LINKS ${lib}/libminizip.a z)
hv_third_party(picojson INCLUDES ${include})
