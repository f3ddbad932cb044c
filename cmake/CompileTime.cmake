# What the build does to keep its own time down, applied to every target once they all exist.
#
# Precompiled headers. Parsing Qt's headers is more than half the compile time of a window class,
# and Qt's and GoogleTest's headers a quarter of a test file's, so each kind of target reuses one
# header set compiled once per build:
#   qt       libraries that use Qt
#   qt_test  test programs that use Qt (Qt, QTest and GoogleTest)
#   test     test programs of the plain-C++ layers (GoogleTest and the standard library only)
# Targets that use neither get none. The header sets only ever add headers in front of a file;
# a header set the compiler cannot use for a file is skipped, never wrong.
option(ND_PCH "Precompile Qt's and GoogleTest's headers" ON)

set(ND_PCH_STD <algorithm> <atomic> <cmath> <cstdint> <cstdio> <cstdlib> <cstring> <filesystem>
    <functional> <memory> <mutex> <optional> <string> <thread> <vector>)
set(ND_PCH_QT <QApplication> <QDrag> <QDropEvent> <QImage> <QMimeData> <QMouseEvent> <QPainter>
    <QPointer> <QString> <QTimer> <QWidget>)

# Whether a target reaches Qt, or GoogleTest, through what it links (our own libraries followed).
function(nd_links_to target pattern result)
    set(seen "")
    set(queue ${target})
    set(found OFF)
    while(queue AND NOT found)
        list(POP_FRONT queue t)
        if(t IN_LIST seen OR NOT TARGET ${t})
            continue()
        endif()
        list(APPEND seen ${t})
        get_target_property(type ${t} TYPE)
        if(type STREQUAL "INTERFACE_LIBRARY")
            get_target_property(links ${t} INTERFACE_LINK_LIBRARIES)
        else()
            get_target_property(links ${t} LINK_LIBRARIES)
        endif()
        foreach(l IN LISTS links)
            if(l MATCHES "${pattern}")
                set(found ON)
            elseif(l MATCHES "^nd_")
                list(APPEND queue ${l})
            endif()
        endforeach()
    endwhile()
    set(${result} ${found} PARENT_SCOPE)
endfunction()

# Qt's test library defines the test program's source and build folders for QFINDTESTDATA, which
# no test of ours uses; the compiler refuses a header set made under other values of them.
function(nd_drop_test_folders target)
    target_compile_options(${target} PRIVATE -UQT_TESTCASE_BUILDDIR -UQT_TESTCASE_SOURCEDIR)
endfunction()

# GCC 12 warns about std::string's own copies when it inlines them into a test at -O2 (its known
# false -Warray-bounds, -Wrestrict, -Wstringop-overflow and -Wstringop-overread). Inside the
# standard library's headers those warnings are silenced, but not once the headers come from a
# precompiled set: the tests, which build strings freely, would stop on them. The libraries keep
# every warning.
function(nd_quiet_library_warnings target)
    if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
        target_compile_options(${target} PRIVATE -Wno-array-bounds -Wno-restrict
            -Wno-stringop-overflow -Wno-stringop-overread)
    endif()
endfunction()

function(nd_targets_under dir result)
    get_property(targets DIRECTORY ${dir} PROPERTY BUILDSYSTEM_TARGETS)
    get_property(subdirs DIRECTORY ${dir} PROPERTY SUBDIRECTORIES)
    foreach(sub IN LISTS subdirs)
        nd_targets_under(${sub} more)
        list(APPEND targets ${more})
    endforeach()
    set(${result} ${targets} PARENT_SCOPE)
endfunction()

# Test programs carry line tables only (-g1): enough for every stack trace a sanitizer or a
# debugger prints with file and line, and a third less compile time than full debug information.
function(nd_test_debug_info target)
    if(CMAKE_BUILD_TYPE MATCHES "Deb" AND CMAKE_CXX_COMPILER_ID MATCHES "GNU|Clang")
        target_compile_options(${target} PRIVATE -g1)
    endif()
endfunction()

function(nd_tune_compile_time)
    nd_targets_under(${PROJECT_SOURCE_DIR} targets)
    foreach(t IN LISTS targets)
        get_target_property(type ${t} TYPE)
        if(type STREQUAL "EXECUTABLE")
            nd_links_to(${t} "^GTest::" gtest)
            if(gtest)
                nd_test_debug_info(${t})
            endif()
        endif()
    endforeach()
    if(ND_PCH)
        nd_precompile_headers("${targets}")
    endif()
endfunction()

function(nd_precompile_headers targets)
    # A header set the compiler turns down is a silent slow-down; with warnings as errors this
    # stops the build instead.
    target_compile_options(nd_options INTERFACE -Winvalid-pch)
    # The donors: one small target per header set, of the same kind and linking the same
    # libraries as the targets that use it, so that it is compiled with their flags.
    set(stub ${PROJECT_BINARY_DIR}/pch/stub.cpp)
    file(CONFIGURE OUTPUT ${stub} CONTENT "int main() { return 0; }\n")
    add_library(nd_pch_qt STATIC ${stub})
    target_link_libraries(nd_pch_qt PRIVATE Qt6::Widgets nd_options)
    target_precompile_headers(nd_pch_qt PRIVATE ${ND_PCH_STD} ${ND_PCH_QT})
    set(donors nd_pch_qt)
    if(ND_BUILD_TESTS)
        find_package(GTest REQUIRED)
        add_executable(nd_pch_qt_test ${stub})
        target_link_libraries(nd_pch_qt_test PRIVATE GTest::gtest Qt6::Widgets Qt6::Test nd_options)
        target_precompile_headers(nd_pch_qt_test PRIVATE ${ND_PCH_STD} ${ND_PCH_QT} <QTest>
            <gtest/gtest.h>)
        nd_drop_test_folders(nd_pch_qt_test)
        add_executable(nd_pch_test ${stub})
        target_link_libraries(nd_pch_test PRIVATE GTest::gtest nd_options)
        target_precompile_headers(nd_pch_test PRIVATE ${ND_PCH_STD} <gtest/gtest.h>)
        list(APPEND donors nd_pch_qt_test nd_pch_test)
    endif()

    foreach(t IN LISTS targets)
        get_target_property(type ${t} TYPE)
        if(t IN_LIST donors OR NOT type MATCHES "^(STATIC_LIBRARY|EXECUTABLE)$")
            continue()
        endif()
        nd_links_to(${t} "^nd_options$" ours)
        if(NOT ours)
            continue()
        endif()
        nd_links_to(${t} "^Qt6::" qt)
        nd_links_to(${t} "^Qt6::Widgets$" widgets)
        nd_links_to(${t} "^Qt6::Test$" qtest)
        nd_links_to(${t} "^GTest::" gtest)
        if(gtest AND type STREQUAL "EXECUTABLE" AND TARGET nd_pch_test)
            nd_quiet_library_warnings(${t})
            if(widgets AND qtest)
                target_precompile_headers(${t} REUSE_FROM nd_pch_qt_test)
                nd_drop_test_folders(${t})
            elseif(NOT qt)
                target_precompile_headers(${t} REUSE_FROM nd_pch_test)
            endif()
        elseif(widgets AND type STREQUAL "STATIC_LIBRARY")
            target_precompile_headers(${t} REUSE_FROM nd_pch_qt)
        endif()
    endforeach()
endfunction()
