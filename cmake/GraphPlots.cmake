# What every target of this project shares, and the three kinds of target that it has: rooms, tests, programs.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")
set(CMAKE_ARCHIVE_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/lib")
set(CMAKE_BUILD_RPATH "$ORIGIN")
set(CMAKE_INSTALL_RPATH "$ORIGIN")
# Only the package's own targets are built for it, not the tests.
set(CMAKE_SKIP_INSTALL_ALL_DEPENDENCY ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)

find_program(CCACHE ccache)
if(CCACHE)
    set(CMAKE_CXX_COMPILER_LAUNCHER "${CCACHE}")
endif()

add_library(GraphPlotsOptions INTERFACE)
target_compile_options(GraphPlotsOptions INTERFACE
    -Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual -Wold-style-cast
    $<$<BOOL:${GRAPHPLOTS_WARNINGS_AS_ERRORS}>:-Werror>)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
    # Optimising, g++ 12 sees overlaps in std::string's operator+ that there are none of.
    target_compile_options(GraphPlotsOptions INTERFACE -Wno-restrict)
endif()
# A tenth of the usual linker's time, which counts with a program for every room's tests.
find_program(LLD ld.lld)
if(LLD)
    target_link_options(GraphPlotsOptions INTERFACE -fuse-ld=lld)
endif()
if(GRAPHPLOTS_SANITIZE)
    target_compile_options(GraphPlotsOptions INTERFACE
        -fsanitize=${GRAPHPLOTS_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
    target_link_options(GraphPlotsOptions INTERFACE -fsanitize=${GRAPHPLOTS_SANITIZE})
    if(GRAPHPLOTS_SANITIZE MATCHES "thread" AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
        # g++ warns that the sanitizer does not understand the fences inside Asio.
        target_compile_options(GraphPlotsOptions INTERFACE -Wno-tsan)
    endif()
endif()

# graphplots_room(Name [SHARED|INTERFACE] SOURCES ... [LINKS ...] [PRIVATE_LINKS ...] [QT])
# One folder, one library. It links the rooms that Arrows.txt puts below it, and LINKS from outside. Includes are written
# "Room/Class.h"; each room shows its own folder alone, so that what it does not link it cannot include.
function(graphplots_room name)
    cmake_parse_arguments(ROOM "SHARED;INTERFACE;QT" "" "SOURCES;LINKS;PRIVATE_LINKS" ${ARGN})
    set(door "${CMAKE_BINARY_DIR}/include/${name}")
    file(MAKE_DIRECTORY "${door}")
    file(CREATE_LINK "${CMAKE_CURRENT_SOURCE_DIR}" "${door}/${name}" SYMBOLIC)
    set(below ${GRAPHPLOTS_BELOW_${name}})
    if(ROOM_INTERFACE)
        add_library(${name} INTERFACE)
        target_include_directories(${name} INTERFACE "${door}")
        target_link_libraries(${name} INTERFACE ${below} ${ROOM_LINKS})
        return()
    endif()
    if(ROOM_SHARED)
        add_library(${name} SHARED ${ROOM_SOURCES})
    else()
        add_library(${name} STATIC ${ROOM_SOURCES})
    endif()
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
        # Silent changes of a number, which clang and g++ see differently.
        target_compile_options(${name} PRIVATE
            -Wconversion -Wsign-conversion -Wdouble-promotion -Wduplicated-cond -Wlogical-op)
    endif()
    target_include_directories(${name} PUBLIC "${door}")
    target_link_libraries(${name} PUBLIC ${below} ${ROOM_LINKS} PRIVATE GraphPlotsOptions ${ROOM_PRIVATE_LINKS})
    if(ROOM_QT)
        set_target_properties(${name} PROPERTIES AUTOMOC ON AUTORCC ON)
        target_compile_definitions(${name} PRIVATE QT_NO_KEYWORDS QT_NO_CAST_TO_ASCII)
    endif()
endfunction()

# graphplots_test(Name SOURCES ... LINKS ... [QT] [ALONE Suite.*]): one executable a mirrored folder, its cases known to
# CTest. Those of a suite that types on the keyboard run with no other test beside them: there is one focus a display.
function(graphplots_test name)
    cmake_parse_arguments(TEST "QT" "ALONE" "SOURCES;LINKS" ${ARGN})
    add_executable(${name} ${TEST_SOURCES})
    target_link_libraries(${name} PRIVATE GraphPlotsOptions TestSupport ${TEST_LINKS})
    if(TEST_QT)
        set_target_properties(${name} PROPERTIES AUTOMOC ON)
        target_compile_definitions(${name} PRIVATE QT_NO_KEYWORDS)
        target_link_libraries(${name} PRIVATE TestSupportQt)
    else()
        target_link_libraries(${name} PRIVATE GTest::gtest_main)
    endif()
    set(properties TIMEOUT 300 ENVIRONMENT "GRAPHPLOTS_TEST_DATA=${GRAPHPLOTS_TEST_DATA}")
    if(TEST_ALONE)
        gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST TEST_FILTER "${TEST_ALONE}" PROPERTIES RUN_SERIAL ON ${properties})
        gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST TEST_FILTER "-${TEST_ALONE}" PROPERTIES ${properties})
    else()
        gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST PROPERTIES ${properties})
    endif()
endfunction()
