find_package(Boost 1.81 REQUIRED COMPONENTS filesystem thread)
hv_third_party(boost_filesystem LINKS Boost::filesystem)
hv_third_party(boost_thread LINKS Boost::thread)

hv_third_party(log4cpp LINKS log4cpp Threads::Threads)
# Made with this preset's sanitizers when they are not in the cache; one question otherwise.
get_directory_property(flags COMPILE_OPTIONS)
execute_process(
    COMMAND ${CMAKE_SOURCE_DIR}/scripts/hosted-libraries ${CMAKE_C_COMPILER} ${CMAKE_CXX_COMPILER} ${flags}
    OUTPUT_VARIABLE made
    OUTPUT_STRIP_TRAILING_WHITESPACE
    COMMAND_ERROR_IS_FATAL ANY
)
hv_third_party(tinyxml INCLUDES ${made}/include LINKS ${made}/lib/libtinyxml.a DEFINES TIXML_USE_STL)
hv_third_party(zlib LINKS z)
hv_third_party(minizip INCLUDES ${made}/include LINKS ${made}/lib/libminizip.a z)
hv_third_party(picojson)

find_package(benchmark REQUIRED)
hv_third_party(benchmark LINKS benchmark::benchmark)
