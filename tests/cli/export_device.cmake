# Exports a device written by mkipod with the command line as a user would, twice, and checks
# the copies byte for byte, the organized layout, numbered clashes, what the second run reports,
# and the M3U8 playlists with a real player's parser (mpv) where one is installed and with a
# strict reader of their format in any case.
file(REMOVE_RECURSE ${WORK})
file(MAKE_DIRECTORY ${WORK}/config)
file(WRITE ${WORK}/device.txt [=[
device "Export Pod"
track id=10 title="Salt" artist="Lantern" album="Harbour" genre="Folk" location=":iPod_Control:Music:F00:AAAA.wav" length=1200 media=tone:440
track id=11 title="Salt" artist="Lantern" album="Harbour" location=":iPod_Control:Music:F01:BBBB.wav" length=1500 media=tone:550
track id=12 title="Salt.WAV" artist="Lantern" album="Harbour" location=":iPod_Control:Music:F02:CCCC.wav" length=1800 media=tone:660
track id=13 title="Dots" artist=".." album=".." location=":iPod_Control:Music:F03:DDDD.wav" length=900 media=tone:330
track id=14 title="Zero" artist="Empty" album="Nothing" location=":iPod_Control:Music:F04:EEEE.wav" length=600 size=0 media=tone:500
track id=15 title="Gone" artist="Lost" album="Lost" location=":iPod_Control:Music:F05:FFFF.wav" size=500 media=none
track id=16 title="AC/DC: Live?" artist="Band" album="Album" location=":iPod_Control:Music:F06:GGGG.WAV" length=700 media=tone:220
playlist name="Mix" ids=16,10,11,13
playlist name="Zero and Gone" ids=14,15
]=])
execute_process(COMMAND ${MKIPOD} ${WORK}/device.txt ${WORK}/device RESULT_VARIABLE status OUTPUT_QUIET)
if(NOT status EQUAL 0)
  message(FATAL_ERROR "mkipod failed: ${status}")
endif()

set(environment ${CMAKE_COMMAND} -E env HOME=${WORK} XDG_CONFIG_HOME=${WORK}/config)
function(export_tracks expected_status output_variable)
  execute_process(COMMAND ${environment} ${CLI} export --device ${WORK}/device ${ARGN}
                  OUTPUT_VARIABLE output ERROR_VARIABLE error RESULT_VARIABLE status)
  if(NOT status EQUAL expected_status)
    message(FATAL_ERROR "export ${ARGN} gave ${status}, not ${expected_status}:\n${output}\n${error}")
  endif()
  set(${output_variable} "${output}${error}" PARENT_SCOPE)
endfunction()

function(expect_text text pattern)
  string(FIND "${text}" "${pattern}" at)
  if(at EQUAL -1)
    message(FATAL_ERROR "expected \"${pattern}\" in:\n${text}")
  endif()
endfunction()

# Device file and where its copy must be.
set(copies
  F00/AAAA.wav "Lantern/Harbour/Salt.wav"
  F01/BBBB.wav "Lantern/Harbour/Salt[0].wav"
  F02/CCCC.wav "Lantern/Harbour/Salt[1].wav"
  F03/DDDD.wav "Unknown/Unknown/Dots.wav"
  F04/EEEE.wav "Empty/Nothing/Zero.wav"
  F06/GGGG.WAV "Band/Album/AC_DC_ Live_.WAV")
function(check_copies)
  set(list ${copies})
  while(list)
    list(POP_FRONT list source target)
    if(NOT EXISTS "${WORK}/out/${target}")
      message(FATAL_ERROR "no copy at ${target}")
    endif()
    file(SHA256 "${WORK}/device/iPod_Control/Music/${source}" expected)
    file(SHA256 "${WORK}/out/${target}" actual)
    if(NOT expected STREQUAL actual)
      message(FATAL_ERROR "${target} differs from ${source}")
    endif()
  endwhile()
endfunction()

# First run: everything but the missing file, organized, with the playlists.
export_tracks(0 first --out ${WORK}/out --organized --ids 10,11,12,13,14,16 --playlists-m3u)
expect_text("${first}" "copied 6, already present 0, failed 0")
check_copies()
file(GLOB_RECURSE made RELATIVE ${WORK}/out ${WORK}/out/*)
list(LENGTH made count)
if(NOT count EQUAL 8)
  message(FATAL_ERROR "unexpected files in the output folder: ${made}")
endif()

# Second run: nothing copied again but the track whose size field is 0.
export_tracks(0 second --out ${WORK}/out --organized --ids 10,11,12,13,14,16 --playlists-m3u)
expect_text("${second}" "copied 1, already present 5, failed 0")
file(SHA256 "${WORK}/device/iPod_Control/Music/F04/EEEE.wav" zero)
file(SHA256 "${WORK}/out/Empty/Nothing/Zero[0].wav" zeroAgain)
if(NOT zero STREQUAL zeroAgain)
  message(FATAL_ERROR "the size-0 track was not copied anew under the next number")
endif()

# A file missing on the device fails with its reason and the exit status 1.
export_tracks(1 missing --out ${WORK}/out --ids 15)
expect_text("${missing}" "failed: 15 \"Gone\": the file is missing on the device")

# Without --out and --organized the stored folder and option are used.
file(WRITE ${WORK}/config/kestrune/settings.ini
     "[HKEY_CURRENT_USER\\Software\\Kestrune]\nOuputPath=${WORK}/stored\nOrganized=false\n")
export_tracks(0 stored --search "lantern")
if(NOT EXISTS "${WORK}/stored/Salt[1].wav")
  message(FATAL_ERROR "the stored folder and flat option were not used:\n${stored}")
endif()

# The playlists: a strict reading of the format, then a player.
function(check_playlist file expected_entries)
  set(player)
  if(MPV)
    set(player ${MPV})
  endif()
  execute_process(COMMAND python3 ${CMAKE_CURRENT_LIST_DIR}/check_playlist.py ${file} ${expected_entries} ${player}
                  OUTPUT_VARIABLE output ERROR_VARIABLE error RESULT_VARIABLE status)
  if(NOT status EQUAL 0)
    message(FATAL_ERROR "${output}${error}")
  endif()
endfunction()
# Each run extended the playlists: Mix has its four copies twice; the size-0 track is listed
# under both of its names.
check_playlist("${WORK}/out/Playlists/Mix.m3u8" 8)
check_playlist("${WORK}/out/Playlists/Zero and Gone.m3u8" 2)
file(REMOVE_RECURSE ${WORK})
