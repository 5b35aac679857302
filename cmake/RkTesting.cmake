# rk_add_qtest(<name> SOURCES <files...> [LIBS <targets...>] [TIMEOUT <s>])
# One QtTest program registered with CTest. Tests run under a private HOME and config folder so
# they never read or write the user's own settings.
set(RK_TEST_HOME ${CMAKE_BINARY_DIR}/test-home)
set(RK_LSAN_SUPPRESSIONS ${PROJECT_SOURCE_DIR}/tests/lsan.supp)
# Slow unwinding on malloc: Mesa's GL driver is unloaded before the leak check runs, and only a full
# stack still reaches a frame in a loaded system library that the suppressions can name.
# Under the sanitizers the GL driver's JIT compiler (llvmpipe) registers unwind tables while holding
# the unwinder's lock, and slow unwinding on malloc then deadlocks: sanitizer runs draw with the
# driver's plain software rasteriser instead.
set(RK_TEST_GL_ENV "")
if(RK_SANITIZE)
    set(RK_TEST_GL_ENV "GALLIUM_DRIVER=softpipe;")
endif()

function(rk_add_qtest name)
    cmake_parse_arguments(T "" "TIMEOUT" "SOURCES;LIBS" ${ARGN})
    if(NOT T_TIMEOUT)
        set(T_TIMEOUT 300)
    endif()
    add_executable(${name} ${T_SOURCES})
    target_link_libraries(${name} PRIVATE Qt5::Test rkcore rksupport ${T_LIBS})
    target_include_directories(${name} PRIVATE ${PROJECT_SOURCE_DIR}/tests/common)
    file(MAKE_DIRECTORY ${RK_TEST_HOME}/${name}/config ${RK_TEST_HOME}/${name}/run)
    file(CHMOD ${RK_TEST_HOME}/${name}/run DIRECTORY_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE)
    add_test(NAME ${name} COMMAND ${name})
    set_tests_properties(${name} PROPERTIES
        TIMEOUT ${T_TIMEOUT}
        ENVIRONMENT "${RK_TEST_GL_ENV}HOME=${RK_TEST_HOME}/${name};XDG_CONFIG_HOME=${RK_TEST_HOME}/${name}/config;XDG_RUNTIME_DIR=${RK_TEST_HOME}/${name}/run;LIBGL_ALWAYS_SOFTWARE=1;RK_PLUGIN_PATH=${RK_PLUGIN_BUILD_DIR};ASAN_OPTIONS=detect_leaks=1:abort_on_error=0;LSAN_OPTIONS=suppressions=${RK_LSAN_SUPPRESSIONS}:print_suppressions=0:fast_unwind_on_malloc=0;UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1")
endfunction()
