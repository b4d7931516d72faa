# Fails unless every meta record of the module lies in memory that is read-only once it is loaded:
# CLASSES class records among them, and nothing of them writable.
execute_process(COMMAND "${OBJDUMP}" -pt "${MODULE}" OUTPUT_VARIABLE output COMMAND_ERROR_IS_FATAL ANY)
if(NOT output MATCHES "\n *RELRO ")
    message(FATAL_ERROR "${MODULE} has no part that is made read-only after loading")
endif()
string(REGEX MATCHALL "[^\n]* O [^\n]*(static_meta_class|_properties|_references|_features|meta_repository)E?\n"
       records "${output}")
set(classes 0)
list(FILTER records EXCLUDE REGEX "__odr_asan") # markers of the address sanitizer, one byte each
foreach(record IN LISTS records)
    if(NOT record MATCHES " \\.(data\\.rel\\.ro|rodata)[^ \t]*[ \t]")
        message(FATAL_ERROR "writable: ${record}")
    endif()
    if(record MATCHES "17static_meta_classE")
        math(EXPR classes "${classes} + 1")
    endif()
endforeach()
if(classes LESS CLASSES)
    message(FATAL_ERROR "${classes} class records, not ${CLASSES}")
endif()
message(STATUS "${classes} class and method records are read-only")
