# Test registration. GoogleTest programs gather every test file of their
# folders; Qt Test programs are one per file, since each file holds one test
# object with its own main. Every test runs on Qt's offscreen platform and
# finds the sample files through CV_TEST_DATA.

function(cv_register_test name)
    add_test(NAME ${name} COMMAND ${name})
    set_tests_properties(${name} PROPERTIES
        ENVIRONMENT "QT_QPA_PLATFORM=offscreen;CV_TEST_DATA=${PROJECT_SOURCE_DIR}/tests/data"
        TIMEOUT 600)
endfunction()

# cv_add_test(<name> DIRS <folders...> LIBS <targets...>)
function(cv_add_test name)
    cmake_parse_arguments(ARG "" "" "DIRS;LIBS" ${ARGN})
    cv_glob_sources(sources DIRS ${ARG_DIRS})
    if(NOT sources)
        return()
    endif()
    add_executable(${name} ${sources})
    target_link_libraries(${name} PRIVATE ${ARG_LIBS} cv_test_support GTest::gmock_main)
    cv_register_test(${name})
endfunction()

# cv_add_qt_tests([DIRS <folders...>] [TREES <folders...>] LIBS <targets...>)
function(cv_add_qt_tests)
    cmake_parse_arguments(ARG "" "" "DIRS;TREES;LIBS" ${ARGN})
    cv_glob_sources(sources DIRS ${ARG_DIRS} TREES ${ARG_TREES})
    foreach(source ${sources})
        get_filename_component(base ${source} NAME_WE)
        set(name qt_${base})
        add_executable(${name} ${source})
        set_target_properties(${name} PROPERTIES AUTOMOC ON)
        target_link_libraries(${name} PRIVATE ${ARG_LIBS} cv_test_support Qt6::Test)
        cv_register_test(${name})
    endforeach()
endfunction()
