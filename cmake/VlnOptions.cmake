# Compiler settings of the project's own code.

set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_C_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/lib")

set(VLN_WORD_SIZE 64 CACHE STRING "Word size to build for: 32 or 64")
set(VLN_SANITIZE "" CACHE STRING "Sanitizers, as -fsanitize takes them")
option(VLN_CHECK_LOCKS "Assert the lock order at run time" OFF)

find_package(Threads REQUIRED)

# Settings that everything is compiled and linked with, GoogleTest included.
add_compile_options(-m${VLN_WORD_SIZE})
add_link_options(-m${VLN_WORD_SIZE})
add_compile_definitions(_FILE_OFFSET_BITS=64)
if(VLN_WORD_SIZE EQUAL 32)
    # The reference platform: SSE arithmetic, so that real numbers print alike on both word sizes.
    add_compile_options(-msse2 -mfpmath=sse)
    add_compile_definitions(_TIME_BITS=64)
endif()
if(VLN_SANITIZE)
    add_compile_options(-fsanitize=${VLN_SANITIZE} -fno-omit-frame-pointer
                        -fno-sanitize-recover=all)
    add_link_options(-fsanitize=${VLN_SANITIZE})
endif()
# No path of this machine in what is built, and the same bytes wherever that is done. Of two maps that
# fit, the later one counts.
add_compile_options("-ffile-prefix-map=${CMAKE_SOURCE_DIR}/=" "-ffile-prefix-map=${CMAKE_BINARY_DIR}=build")
if(VLN_CHECK_LOCKS)
    add_compile_definitions(CIMPLE_CHECK_LOCKS)
endif()
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    # A unique symbol would be one for all modules of a process.
    add_compile_options($<$<COMPILE_LANGUAGE:CXX>:-fno-gnu-unique>)
endif()

# Warnings are errors in the project's own code only: link to vln_warnings.
add_library(vln_warnings INTERFACE)
target_compile_options(vln_warnings INTERFACE -Wall -Wextra -Wformat=2 -Wconversion -Werror)
target_include_directories(vln_warnings INTERFACE "${CMAKE_SOURCE_DIR}")
