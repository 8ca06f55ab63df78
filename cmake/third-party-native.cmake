find_package(Boost 1.81 REQUIRED COMPONENTS filesystem thread)
hv_third_party(boost_filesystem LINKS Boost::filesystem)
hv_third_party(boost_thread LINKS Boost::thread)

hv_third_party(log4cpp LINKS log4cpp Threads::Threads)
hv_third_party(tinyxml LINKS tinyxml DEFINES TIXML_USE_STL)
hv_third_party(zlib LINKS z)
hv_third_party(minizip LINKS minizip z)
hv_third_party(picojson)

find_package(benchmark REQUIRED)
hv_third_party(benchmark LINKS benchmark::benchmark)
