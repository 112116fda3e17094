# The OPC UA test peer (tests/ua/peer, node-opcua) as a CTest fixture.
#
# cv_ua_peer_fixture(<fixture> [SERVER_ARGS <server.js options>...])
#   Adds the tests <fixture>_start (FIXTURES_SETUP) and <fixture>_stop
#   (FIXTURES_CLEANUP). The start test runs server.js in the background on a free
#   port of 127.0.0.1, waits for it to listen and writes its endpoint URL to
#   <build>/ua-peer/<fixture>/url; the stop test ends it by its process id.
#   Each fixture is its own server process, so fixtures run side by side.
#
# cv_ua_peer_use(<test> <fixture>)
#   Makes <test> (added in the calling folder) require the fixture and tells it
#   where the URL is: CV_UA_PEER_URL_FILE=<build>/ua-peer/<fixture>/url.

set(CV_UA_PEER_DIR ${CMAKE_CURRENT_LIST_DIR}/../tests/ua/peer)
cmake_path(NORMAL_PATH CV_UA_PEER_DIR)

function(cv_ua_peer_state_dir fixture out)
    set(${out} ${CMAKE_BINARY_DIR}/ua-peer/${fixture} PARENT_SCOPE)
endfunction()

function(cv_ua_peer_fixture fixture)
    cmake_parse_arguments(ARG "" "" "SERVER_ARGS" ${ARGN})
    cv_ua_peer_state_dir(${fixture} state)
    add_test(NAME ${fixture}_start
             COMMAND bash ${CV_UA_PEER_DIR}/start.sh ${state} ${ARG_SERVER_ARGS})
    set_tests_properties(${fixture}_start PROPERTIES FIXTURES_SETUP ${fixture} TIMEOUT 90)
    add_test(NAME ${fixture}_stop COMMAND bash ${CV_UA_PEER_DIR}/stop.sh ${state})
    set_tests_properties(${fixture}_stop PROPERTIES FIXTURES_CLEANUP ${fixture} TIMEOUT 30)
endfunction()

function(cv_ua_peer_use test fixture)
    cv_ua_peer_state_dir(${fixture} state)
    set_property(TEST ${test} APPEND PROPERTY FIXTURES_REQUIRED ${fixture})
    set_property(TEST ${test} APPEND PROPERTY ENVIRONMENT "CV_UA_PEER_URL_FILE=${state}/url")
endfunction()
