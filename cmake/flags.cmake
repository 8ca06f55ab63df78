# How everything is compiled: the language, optimisation, the sanitizers, and (for our own code alone) the warnings.
#
# hv_flags is linked by all of our own targets and by nobody else's.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)

# Release is what ships and what is measured; -g1 gives stack traces line numbers at little cost. Windows programs are
# linked statically, where debug information would make each of them a hundred megabytes.
set(CMAKE_C_FLAGS_RELEASE "-O2 -DNDEBUG")
set(CMAKE_CXX_FLAGS_RELEASE "-O2 -DNDEBUG")
if(NOT WIN32)
    string(APPEND CMAKE_CXX_FLAGS_RELEASE " -g1")
endif()

# Debug is what the sanitizers watch; the standard library checks its own preconditions there too.
set(CMAKE_C_FLAGS_DEBUG "-O1 -g")
set(CMAKE_CXX_FLAGS_DEBUG "-O1 -g -D_GLIBCXX_ASSERTIONS")

set(HV_SANITIZE "" CACHE STRING "Sanitizers of the compiler, separated by commas")
if(HV_SANITIZE)
    add_compile_options(-fsanitize=${HV_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer)
    add_link_options(-fsanitize=${HV_SANITIZE})
endif()

# Everything then says which way a run took, and the programs in fuzz/ listen (clang only).
option(HV_FUZZ "Whether the programs of fuzz/ are built" OFF)
if(HV_FUZZ)
    add_compile_options(-fsanitize=fuzzer-no-link)
endif()

# What ships ends rather than go on with a stack or a buffer that has been written over; scripts/windows-libraries has the
# same for other people's code. Windows 10 is the least, and says so itself to whoever starts a program on an older one.
if(WIN32)
    add_compile_options(-fstack-protector-strong $<$<CONFIG:Release>:-D_FORTIFY_SOURCE=2>)
    add_link_options(-fstack-protector-strong)
    add_link_options(-Wl,--major-os-version,10,--minor-os-version,0,--major-subsystem-version,10,--minor-subsystem-version,0)
endif()

# What ships is stripped and says nothing of the time at which it was made; it may be loaded anywhere, and its data are
# not run.
if(WIN32)
    add_link_options(-s -Wl,--no-insert-timestamp,--dynamicbase,--high-entropy-va,--nxcompat)
endif()

add_library(hv_flags INTERFACE)
target_include_directories(hv_flags INTERFACE ${CMAKE_SOURCE_DIR})
target_compile_options(hv_flags INTERFACE -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
    # HVL::Version has virtual operations and no virtual destructor, as its header says; clang objects to lists of it.
    target_compile_options(hv_flags INTERFACE $<$<COMPILE_LANGUAGE:CXX>:-Wno-delete-non-abstract-non-virtual-dtor>)
endif()
# Nobody waits here until a time of day, and the library for those is an eighth of what a source of the engine reads.
target_compile_definitions(hv_flags INTERFACE BOOST_THREAD_DONT_USE_DATETIME)
if(WIN32)
    # NOGDI: the drawing interface defines the macro ERROR, which is the name of a log4cpp priority.
    target_compile_definitions(hv_flags INTERFACE WIN32_LEAN_AND_MEAN NOMINMAX NOGDI _WIN32_WINNT=0x0A00 PSAPI_VERSION=2)
endif()
