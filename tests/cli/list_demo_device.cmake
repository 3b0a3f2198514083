# Writes the demo device, lists it with the command line, and checks what a user would see.
file(REMOVE_RECURSE ${WORK})
execute_process(COMMAND ${MKIPOD} --demo ${WORK}/device RESULT_VARIABLE status)
if(NOT status EQUAL 0)
  message(FATAL_ERROR "mkipod failed: ${status}")
endif()

execute_process(COMMAND ${CLI} list --device ${WORK}/device --json
                OUTPUT_VARIABLE json RESULT_VARIABLE status)
if(NOT status EQUAL 0)
  message(FATAL_ERROR "list failed: ${status}")
endif()
string(JSON device GET "${json}" device)
string(JSON tracks LENGTH "${json}" tracks)
string(JSON playlists LENGTH "${json}" playlists)
string(JSON firstPath GET "${json}" tracks 0 path)
if(NOT device STREQUAL "Kestrune Demo" OR NOT tracks EQUAL 36 OR NOT playlists EQUAL 5)
  message(FATAL_ERROR "unexpected listing: ${device}, ${tracks} tracks, ${playlists} playlists")
endif()
if(NOT EXISTS "${firstPath}")
  message(FATAL_ERROR "the listed path does not exist: ${firstPath}")
endif()

execute_process(COMMAND ${CLI} list --device ${WORK}/missing
                ERROR_VARIABLE error RESULT_VARIABLE status)
if(NOT status EQUAL 2 OR NOT error MATCHES "no device found")
  message(FATAL_ERROR "a folder without a device gave ${status}: ${error}")
endif()
file(REMOVE_RECURSE ${WORK})
