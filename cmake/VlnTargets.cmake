# How a room of the product, a test and a library of GoogleTest are declared.

set(VLN_GENERATED_DIR "${CMAKE_BINARY_DIR}/generated")

# A room of the product: an object library, since the rooms of the module call one another and are
# linked into one shared library at the end. Its sources are all .cpp files of the folder.
#   vln_room(NAME [SCHEMA] [EXCLUDE file...])
# SCHEMA: the room includes generated class headers ("classes/VLNMPCA_Card.h").
function(vln_room name)
    cmake_parse_arguments(ARG "SCHEMA" "" "EXCLUDE" ${ARGN})
    file(GLOB sources CONFIGURE_DEPENDS "${CMAKE_CURRENT_SOURCE_DIR}/*.cpp")
    foreach(file IN LISTS ARG_EXCLUDE)
        list(REMOVE_ITEM sources "${CMAKE_CURRENT_SOURCE_DIR}/${file}")
    endforeach()
    add_library(vln_${name} OBJECT ${sources})
    target_link_libraries(vln_${name} PUBLIC vln_warnings Threads::Threads)
    if(ARG_SCHEMA)
        target_include_directories(vln_${name} PUBLIC "${VLN_GENERATED_DIR}")
        add_dependencies(vln_${name} vln_generate)
    endif()
endfunction()

# GoogleTest is built from Debian's source package, so that both word sizes have it.
function(vln_need_gtest)
    if(NOT TARGET gtest_main)
        set(BUILD_GMOCK OFF CACHE BOOL "" FORCE)
        set(INSTALL_GTEST OFF CACHE BOOL "" FORCE)
        add_subdirectory(/usr/src/googletest "${CMAKE_BINARY_DIR}/googletest" EXCLUDE_FROM_ALL
                         SYSTEM)
    endif()
endfunction()

# A test program: vln_test(NAME SOURCES file... LIBRARIES target...). The objects of the named rooms
# are linked in. ctest runs it as one test, in a folder of its own.
function(vln_test name)
    cmake_parse_arguments(ARG "" "TIMEOUT" "SOURCES;LIBRARIES;DEFINITIONS" ${ARGN})
    vln_need_gtest()
    add_executable(${name} ${ARG_SOURCES})
    target_link_libraries(${name} PRIVATE vln_warnings Threads::Threads ${ARG_LIBRARIES} gtest_main
                                          ${CMAKE_DL_LIBS})
    target_include_directories(${name} PRIVATE "${VLN_GENERATED_DIR}")
    if(ARG_DEFINITIONS)
        target_compile_definitions(${name} PRIVATE ${ARG_DEFINITIONS})
    endif()
    set(folder "${CMAKE_BINARY_DIR}/tests/run/${name}")
    file(MAKE_DIRECTORY "${folder}")
    add_test(NAME ${name} COMMAND ${name} WORKING_DIRECTORY "${folder}")
    if(NOT ARG_TIMEOUT)
        set(ARG_TIMEOUT 120)
    endif()
    set_tests_properties(${name} PROPERTIES TIMEOUT ${ARG_TIMEOUT})
endfunction()
