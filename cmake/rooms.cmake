# The four things that a room's CMakeLists.txt can ask for. A room's file is a list; the how stands here.

# hv_room(NAME SOURCES file... LINKS target...): the static library hv_NAME; what it links, its users link too.
function(hv_room name)
    cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
    hv_refuse_leftovers(hv_room ${name} "${ARG_UNPARSED_ARGUMENTS}")
    add_library(hv_${name} STATIC ${ARG_SOURCES})
    target_link_libraries(hv_${name} PUBLIC ${ARG_LINKS} PRIVATE hv_flags)
endfunction()

# hv_program(NAME [ADMINISTRATOR] [OLD_CODE_PAGE] SOURCES file... LINKS target...): the program NAME in the preset's bin
# folder. ADMINISTRATOR: Windows asks for elevation when it starts. OLD_CODE_PAGE: it has the system's code page, as every
# program has on Windows before version 1903.
function(hv_program name)
    cmake_parse_arguments(ARG "ADMINISTRATOR;OLD_CODE_PAGE" "" "SOURCES;LINKS" ${ARGN})
    hv_refuse_leftovers(hv_program ${name} "${ARG_UNPARSED_ARGUMENTS}")
    add_executable(${name} ${ARG_SOURCES})
    target_link_libraries(${name} PRIVATE ${ARG_LINKS} hv_flags)
    set(code_page "<activeCodePage xmlns=\"http://schemas.microsoft.com/SMI/2019/WindowsSettings\">UTF-8</activeCodePage>")
    if(ARG_ADMINISTRATOR)
        hv_complete_windows_program(${name} requireAdministrator "${code_page}")
    elseif(ARG_OLD_CODE_PAGE)
        hv_complete_windows_program(${name} asInvoker "")
    else()
        hv_complete_windows_program(${name} asInvoker "${code_page}")
    endif()
endfunction()

# hv_test(NAME [OLD_CODE_PAGE] SOURCES file... LINKS target...): a GoogleTest program that ctest runs, on every target.
# There is no other list of tests.
function(hv_test name)
    cmake_parse_arguments(ARG "OLD_CODE_PAGE" "" "SOURCES;LINKS" ${ARGN})
    hv_refuse_leftovers(hv_test ${name} "${ARG_UNPARSED_ARGUMENTS}")
    set(code_page)
    if(ARG_OLD_CODE_PAGE)
        set(code_page OLD_CODE_PAGE)
    endif()
    hv_program(${name} ${code_page} SOURCES ${ARG_SOURCES} LINKS ${ARG_LINKS} hv_test_support third::gtest_main)
    if(WIN32)
        add_test(NAME ${name} COMMAND ${name})
    else()
        # A test that leaves something on the host fails, whatever it says itself.
        add_test(NAME ${name} COMMAND ${CMAKE_SOURCE_DIR}/scripts/hosted-run $<TARGET_FILE:${name}>)
    endif()
    set_property(GLOBAL APPEND PROPERTY HV_TEST_PROGRAMS ${name})
    hv_compile_quickly(${name})
    # A test names its machine. Where it does not, it must fail rather than use the machine in the user's home.
    set_tests_properties(${name} PROPERTIES ENVIRONMENT HV_MACHINE=/dev/null/no-machine)
endfunction()

# hv_fuzzer(NAME SOURCES file... LINKS target...): the program fuzz_NAME, which calls the sources' LLVMFuzzerTestOneInput
# with bytes of its own making. The target `fuzzers` is all of them.
function(hv_fuzzer name)
    cmake_parse_arguments(ARG "" "" "SOURCES;LINKS" ${ARGN})
    hv_refuse_leftovers(hv_fuzzer ${name} "${ARG_UNPARSED_ARGUMENTS}")
    hv_program(fuzz_${name} SOURCES ${ARG_SOURCES} LINKS ${ARG_LINKS} hv_fuzzing)
    target_link_options(fuzz_${name} PRIVATE -fsanitize=fuzzer)
    if(NOT TARGET fuzzers)
        add_custom_target(fuzzers)
    endif()
    add_dependencies(fuzzers fuzz_${name})
endfunction()

# Half of the time that a test's source takes to compile goes into optimising it, and it runs once. What it tests is
# optimised as it ships.
function(hv_compile_quickly target)
    target_compile_options(${target} PRIVATE -O0 -U_FORTIFY_SOURCE)
endfunction()

function(hv_refuse_leftovers function name leftovers)
    if(leftovers)
        message(FATAL_ERROR "${function}(${name}): what is meant by ${leftovers}?")
    endif()
endfunction()
