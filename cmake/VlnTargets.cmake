# How a room of the product, a test and a library of GoogleTest are declared.

set(VLN_GENERATED_DIR "${CMAKE_BINARY_DIR}/generated")
# The generated files that object managers take.
set(VLN_SHARE_DIR "${CMAKE_BINARY_DIR}/share")

# A room of the product: an object library, since the rooms of the module call one another and are
# linked into one shared library at the end. Its sources are all .cpp files of the folder.
#   vln_room(NAME [SCHEMA] [FOLDERS])
# SCHEMA: the room includes generated class headers ("classes/VLNMPCA_Card.h"). FOLDERS: the folders below
# it belong to it as well.
function(vln_room name)
    cmake_parse_arguments(ARG "SCHEMA;FOLDERS" "" "" ${ARGN})
    set(glob GLOB)
    if(ARG_FOLDERS)
        set(glob GLOB_RECURSE)
    endif()
    file(${glob} sources CONFIGURE_DEPENDS "${CMAKE_CURRENT_SOURCE_DIR}/*.cpp")
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
    # Each process of a build with counters reads and writes them all at its end.
    if(CMAKE_CXX_FLAGS_RELEASE MATCHES "--coverage")
        math(EXPR ARG_TIMEOUT "${ARG_TIMEOUT} * 5")
    endif()
    set_tests_properties(${name} PROPERTIES TIMEOUT ${ARG_TIMEOUT})
    if(VLN_SANITIZE STREQUAL "thread")
        set_tests_properties(${name} PROPERTIES ENVIRONMENT
            "TSAN_OPTIONS=suppressions=${CMAKE_SOURCE_DIR}/tests/tsan.supp:halt_on_error=1")
    endif()
endfunction()

# The rooms that the shared library is made of.
set(VLN_PRODUCT_ROOMS vln_cimple vln_schema_meta vln_schema vln_foundation vln_library
    vln_operations vln_device vln_agent vln_services vln_derivedObjects)

# A module of the product's objects. With REPLACE, the objects of the named sources are left out and
# the given sources take their place: the simulation's module differs in the host's root folder, the
# clock and the kernel's network interfaces, and in nothing else.
#   vln_module(TARGET OUTPUT_DIRECTORY [REPLACE name...] [WITH source...] [LIBRARIES target...]
#              [NO_EXPORT_MAP])
function(vln_module target directory)
    cmake_parse_arguments(ARG "NO_EXPORT_MAP" "" "REPLACE;WITH;LIBRARIES" ${ARGN})
    set(objects "")
    foreach(room IN LISTS VLN_PRODUCT_ROOMS)
        if(TARGET ${room})
            set(list "$<TARGET_OBJECTS:${room}>")
            foreach(name IN LISTS ARG_REPLACE)
                set(list "$<FILTER:${list},EXCLUDE,/${name}[.]o$>")
            endforeach()
            list(APPEND objects "${list}")
        endif()
    endforeach()
    add_library(${target} MODULE ${objects} ${ARG_WITH})
    target_link_libraries(${target} PRIVATE vln_warnings Threads::Threads ${CMAKE_DL_LIBS}
                                            ${ARG_LIBRARIES})
    set_target_properties(${target} PROPERTIES
        LIBRARY_OUTPUT_DIRECTORY "${directory}"
        LINKER_LANGUAGE CXX)
    if(NOT ARG_NO_EXPORT_MAP)
        set_target_properties(${target} PROPERTIES
            OUTPUT_NAME vorlan_mpca_provider
            LINK_DEPENDS "${VLN_GENERATED_DIR}/export.map")
        target_link_options(${target} PRIVATE
            "LINKER:--version-script=${VLN_GENERATED_DIR}/export.map")
    endif()
    target_link_options(${target} PRIVATE "LINKER:-z,relro")
    if(NOT VLN_SANITIZE)
        target_link_options(${target} PRIVATE "LINKER:--no-undefined")
    endif()
    # An object manager may drop the module while a thread of it, or a caller, is still inside.
    target_link_options(${target} PRIVATE "LINKER:-z,nodelete")
    target_include_directories(${target} PRIVATE "${VLN_GENERATED_DIR}")
    add_dependencies(${target} vln_generate)
endfunction()

# The same objects on a simulated host: the root folder, the clock, the host's name and its network
# interfaces come from the simulator.
#   vln_simulated_module(TARGET OUTPUT_DIRECTORY [WITH source...] [NO_EXPORT_MAP])
function(vln_simulated_module target directory)
    cmake_parse_arguments(ARG "NO_EXPORT_MAP" "" "WITH" ${ARGN})
    set(names host_root.cpp system_clock.cpp host_identity.cpp kernel_ip_calls.cpp)
    list(TRANSFORM names PREPEND "${CMAKE_SOURCE_DIR}/simulator/hooks/" OUTPUT_VARIABLE sources)
    list(APPEND sources "${CMAKE_SOURCE_DIR}/simulator/hooks/environment.cpp")
    set(map "")
    if(ARG_NO_EXPORT_MAP)
        set(map NO_EXPORT_MAP)
    endif()
    vln_module(${target} "${directory}" REPLACE ${names} WITH ${sources} ${ARG_WITH}
        LIBRARIES vlnsim ${map})
endfunction()
