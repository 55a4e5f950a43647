# The unit tests of the Windows build, run under Wine or on Windows. Tests of the POSIX
# backends (file lock, settings files, TZ rules) and those that need tshark stay out; the
# Windows backends have their own in tests/platform/win32.
set(QV_POSIX_ONLY_TESTS platform/MutexTest.cpp platform/SettingsAndAdaptersTest.cpp
    platform/TimeTest.cpp ptp/TsharkAgreementTest.cpp ptp/FieldsAsTshark.cpp)
list(TRANSFORM QV_POSIX_ONLY_TESTS PREPEND ${CMAKE_CURRENT_SOURCE_DIR}/)

file(GLOB QV_PLATFORM_TESTS CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/platform/*.cpp
     ${CMAKE_CURRENT_SOURCE_DIR}/platform/win32/*.cpp)
list(REMOVE_ITEM QV_PLATFORM_TESTS ${QV_POSIX_ONLY_TESTS})
# Cases that hold on POSIX only: WinErrorTest speaks errno (WinErrorWin32Test speaks the
# system's numbers).
set(QV_POSIX_ONLY_CASES WinErrorTest.*)
list(JOIN QV_POSIX_ONLY_CASES ":" QV_POSIX_ONLY_FILTER)
qv_add_unit_tests(qv_platform_tests SOURCES ${QV_PLATFORM_TESTS} LIBS qv_platform
                  WINE_ARGS --gtest_filter=-${QV_POSIX_ONLY_FILTER})

file(GLOB QV_PTP_TESTS CONFIGURE_DEPENDS
  ${CMAKE_CURRENT_SOURCE_DIR}/ptp/*.cpp ${CMAKE_CURRENT_SOURCE_DIR}/ptp/TLVs/*.cpp)
list(REMOVE_ITEM QV_PTP_TESTS ${QV_POSIX_ONLY_TESTS})
qv_add_unit_tests(qv_ptp_tests SOURCES ${QV_PTP_TESTS} LIBS qv_ptp qv_test_support_ptp)
target_compile_definitions(qv_ptp_tests PRIVATE QV_TEST_DATA_DIR="${CMAKE_CURRENT_SOURCE_DIR}/data")

file(GLOB QV_PTPMGMT_TESTS CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/ptpmgmt/*.cpp)
qv_add_unit_tests(qv_ptpmgmt_tests SOURCES ${QV_PTPMGMT_TESTS}
                  LIBS qv_ptpmgmt qv_test_support_ptpmgmt)

# corbel's host pieces: words, units, times, JSON and exit codes (the command-line answers
# are checked by running the POSIX program).
if(TARGET corbel_host)
  qv_add_unit_tests(qv_corbel_tests SOURCES corbel/ValueTextTest.cpp corbel/UtcTimeTest.cpp
                    corbel/OutcomeTest.cpp LIBS corbel_host)
endif()

# A Windows host as one is written for the platform: <windows.h> before the public headers,
# none of the project's definitions (all of windows.h, with its min and max), the oldest
# standard the headers allow, every warning an error. tools/build-windows runs it against
# real clocks.
add_executable(qv_windows_host ${CMAKE_CURRENT_SOURCE_DIR}/expert/windows/WindowsHost.cpp)
set_target_properties(qv_windows_host PROPERTIES CXX_STANDARD 17)
# -U after the directory's -D on the command line takes them back.
target_compile_options(qv_windows_host PRIVATE -UWIN32_LEAN_AND_MEAN -UNOMINMAX -U_WIN32_WINNT)
target_link_libraries(qv_windows_host PRIVATE qv_host_api qv_warnings)

# The programs whose strings cross the host boundary run with Wine's heap checking: a BSTR
# given back to a heap that did not make it shows as a heap warning, which fails
# tools/build-windows. The others skip it, which costs them ten times their run time.
set_tests_properties(qv_expert_tests qv_expert_client_tests qv_platform_tests PROPERTIES
                     ENVIRONMENT "WINEDEBUG=-all,warn+heap,err+heap")
