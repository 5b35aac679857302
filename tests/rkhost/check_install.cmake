# cmake -DBUILD_DIR=... -DPREFIX=... -DBINDIR=... -P check_install.cmake
file(REMOVE_RECURSE ${PREFIX})
execute_process(COMMAND ${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${PREFIX}
    RESULT_VARIABLE rc OUTPUT_QUIET)
if(NOT rc EQUAL 0)
    message(FATAL_ERROR "cmake --install failed: ${rc}")
endif()
# Only the installed layout may lead the host to its module.
unset(ENV{RK_PLUGIN_PATH})
execute_process(COMMAND ${PREFIX}/${BINDIR}/rkhost --list-plugins
    RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err)
if(NOT rc EQUAL 0)
    message(FATAL_ERROR "installed rkhost failed (${rc}): ${err}")
endif()
string(FIND "${out}" "plug-in folder: ${PREFIX}/" at_prefix)
string(FIND "${out}" "Interface Components" has_module)
string(FIND "${out}" "file: ${PREFIX}/" module_at_prefix)
if(at_prefix EQUAL -1 OR has_module EQUAL -1 OR module_at_prefix EQUAL -1)
    message(FATAL_ERROR "installed host did not load the installed module:\n${out}")
endif()
file(REMOVE_RECURSE ${PREFIX})
