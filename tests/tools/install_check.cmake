# cmake --install into a temporary prefix, a copy of the installed tree in
# another place, and each tree's dpx-decode run from a third directory on a
# bundled sample: the relative run paths and the module search must find
# the tree's own module and libraries.
#
#   cmake -DBUILD_DIR=... -DSOURCE_DIR=... -DWORK_DIR=... [-DEMULATOR=...] -P install_check.cmake

file(REMOVE_RECURSE "${WORK_DIR}")
execute_process(COMMAND "${CMAKE_COMMAND}" --install "${BUILD_DIR}" --prefix "${WORK_DIR}/installed"
                RESULT_VARIABLE rc OUTPUT_QUIET)
if(NOT rc EQUAL 0)
    message(FATAL_ERROR "cmake --install failed (${rc})")
endif()
file(COPY "${WORK_DIR}/installed/" DESTINATION "${WORK_DIR}/copied" USE_SOURCE_PERMISSIONS)
file(MAKE_DIRECTORY "${WORK_DIR}/elsewhere")

function(decode tree)
    execute_process(COMMAND ${EMULATOR} "${WORK_DIR}/${tree}/bin/dpx-decode" ${ARGN}
                    WORKING_DIRECTORY "${WORK_DIR}/elsewhere"
                    RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err)
    if(NOT rc EQUAL 0)
        message(FATAL_ERROR "${tree}: dpx-decode ${ARGN}: exit ${rc}: ${err}")
    endif()
    set(out "${out}" PARENT_SCOPE)
endfunction()

foreach(tree installed copied)
    decode(${tree} --version)
    if(NOT out MATCHES "\nmodule ${WORK_DIR}/${tree}/bin/\\.\\./lib/dpx-camel/3gpp_camel_400_DLL\\.so\ninterface version QZ1\\.02\\.01\n")
        message(FATAL_ERROR "${tree}: --version: ${out}")
    endif()
    decode(${tree} --summary "${SOURCE_DIR}/samples/messages.txt")
    if(NOT out MATCHES "\nmessage 3 Begin otid=01020304 dtid=- CAP v2 \\| invoke 1 Initial DP sk=7 imsi=262011234567890 called=4912345\n")
        message(FATAL_ERROR "${tree}: --summary: ${out}")
    endif()
    message(STATUS "${tree}: the installed dpx-decode decodes the samples")
endforeach()
