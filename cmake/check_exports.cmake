# Fails unless the module's dynamic symbol table defines exactly the seven
# entry points a host looks up.  Run by CTest:
#   cmake -DNM=<nm> -DMODULE=<path to 3gpp_camel_400_DLL.so> -P check_exports.cmake
cmake_minimum_required(VERSION 3.25)

set(expected
    KFE_3gpp_camel_400
    date_conv
    dp_DLLGetPtr
    dp_DLLGetTable
    dpx_PreDecodeMD
    dpx_PreDecodeMV
    dpx_PreDecodeTO)

if(NOT NM OR NOT MODULE)
    message(FATAL_ERROR "usage: cmake -DNM=<nm> -DMODULE=<module.so> -P ${CMAKE_CURRENT_LIST_FILE}")
endif()
if(NOT EXISTS "${MODULE}")
    message(FATAL_ERROR "module not built: ${MODULE}")
endif()

execute_process(
    COMMAND ${NM} -D --defined-only --format=posix "${MODULE}"
    OUTPUT_VARIABLE table
    ERROR_VARIABLE errors
    RESULT_VARIABLE status)
if(NOT status EQUAL 0)
    message(FATAL_ERROR "${NM} failed on ${MODULE}: ${errors}")
endif()

# posix format: "<name> <type> <value> [<size>]", one symbol a line.
string(REPLACE "\n" ";" lines "${table}")
set(exported)
set(not_code)
foreach(line IN LISTS lines)
    if(line MATCHES "^([^ ]+) ([A-Za-z])")
        set(name "${CMAKE_MATCH_1}")
        set(type "${CMAKE_MATCH_2}")
        list(APPEND exported "${name}")
        if(NOT type STREQUAL "T")
            list(APPEND not_code "${name} (${type})")
        endif()
    endif()
endforeach()
list(SORT exported)

set(unexpected ${exported})
list(REMOVE_ITEM unexpected ${expected})
set(missing ${expected})
if(exported)
    list(REMOVE_ITEM missing ${exported})
endif()

if(unexpected OR missing)
    list(JOIN unexpected " " unexpected_text)
    list(JOIN missing " " missing_text)
    message(FATAL_ERROR
        "exported symbols of ${MODULE} differ from the seven entry points\n"
        "  unexpected: ${unexpected_text}\n"
        "  missing:    ${missing_text}")
endif()
if(not_code)
    list(JOIN not_code " " not_code_text)
    message(FATAL_ERROR "entry points that are not functions: ${not_code_text}")
endif()
message(STATUS "module exports exactly the seven entry points")
