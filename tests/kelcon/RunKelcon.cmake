# Drives kelcon through a pipe and a script file and checks what it prints.
# Variables: KELCON (the program), WORK_DIR (scratch directory, emptied first).

file(REMOVE_RECURSE "${WORK_DIR}")
file(MAKE_DIRECTORY "${WORK_DIR}/prefs")
set(prefs "${WORK_DIR}/prefs")
set(plist "${WORK_DIR}/settings.xml")

function(expect_match output pattern what)
  if(NOT output MATCHES "${pattern}")
    message(FATAL_ERROR "${what}: expected to match\n  ${pattern}\nin:\n${output}")
  endif()
endfunction()

# 1. Commands from a pipe: built-ins, host commands, an unknown command and an error.
file(WRITE "${WORK_DIR}/session.txt"
"# a comment, then an empty line

help
trace.set Pipe 7
trace.get Pipe
plist.set ${plist} Name ustring Café au lait
plist.set ${plist} Count int32 42
plist.set ${plist} Ratio double 0.25
plist.print ${plist}
no.such.command
plist.set ${plist} Count int32 many
plist.print ${WORK_DIR}/missing.xml
quit
trace.get NeverReached
")
execute_process(COMMAND "${KELCON}" --prefs "${prefs}"
                INPUT_FILE "${WORK_DIR}/session.txt"
                OUTPUT_VARIABLE out ERROR_VARIABLE err RESULT_VARIABLE rc)
if(NOT rc EQUAL 1)
  message(FATAL_ERROR "a session with failing commands must exit 1, got ${rc}\n${out}\n${err}")
endif()
expect_match("${out}" "Currently installed commands\\.\n-----------------------------\n" "help")
expect_match("${out}" "plist\\.print <file>" "help lists host commands")
expect_match("${out}" "trace category Pipe set to volume 7\\." "trace.set")
expect_match("${out}" "trace volume for category Pipe is 7" "trace.get")
expect_match("${out}" "<key>Count</key>\n<int type='signed' size='32'>42</int>" "plist int32")
expect_match("${out}" "<key>Name</key>\n<ustring>Café au lait</ustring>" "plist ustring")
expect_match("${out}" "<key>Ratio</key>\n<double>0\\.25</double>" "plist double")
expect_match("${err}" "unknown command 'no\\.such\\.command'" "unknown command")
expect_match("${err}" "'many' is not a int32 value" "bad value")
expect_match("${err}" "missing\\.xml" "load error names the file")
if(out MATCHES "NeverReached")
  message(FATAL_ERROR "commands after quit must not run:\n${out}")
endif()

# 2. The trace database outlives the session, in the preferences directory.
execute_process(COMMAND "${KELCON}" --prefs "${prefs}" -c "trace.get Pipe"
                OUTPUT_VARIABLE out RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "-c with a good command must exit 0, got ${rc}")
endif()
expect_match("${out}" "trace volume for category Pipe is 7" "trace database kept")
if(NOT EXISTS "${prefs}/Trace Database.txt")
  message(FATAL_ERROR "no trace database in ${prefs}")
endif()

# 3. A script file; the log file lands in the preferences directory's logs folder.
file(WRITE "${WORK_DIR}/script.txt" "trace.get.master\r\nplist.print ${plist}")
execute_process(COMMAND "${KELCON}" --prefs "${prefs}" "${WORK_DIR}/script.txt"
                OUTPUT_VARIABLE out RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "a clean script must exit 0, got ${rc}\n${out}")
endif()
expect_match("${out}" "Master trace volume is [0-9]+" "script, CRLF line")
expect_match("${out}" "<key>Count</key>" "script, last line without a line end")
file(GLOB logs "${prefs}/logs/*")
if(NOT logs)
  message(FATAL_ERROR "no log file in ${prefs}/logs")
endif()

# 4. JSON and GUID commands.
file(WRITE "${WORK_DIR}/doc.json" "{ \"b\": [1, 2.5, null, true], \"a\": \"x\" } trailing")
file(WRITE "${WORK_DIR}/bad.json" "{\"a\":")
file(WRITE "${WORK_DIR}/data.txt" "json.check ${WORK_DIR}/doc.json
json.format ${WORK_DIR}/doc.json
guid.new
profile.dump
json.check ${WORK_DIR}/bad.json
")
execute_process(COMMAND "${KELCON}" --prefs "${prefs}" --no-log "${WORK_DIR}/data.txt"
                OUTPUT_VARIABLE out ERROR_VARIABLE err RESULT_VARIABLE rc)
expect_match("${out}" "valid JSON: an object with 2 members" "json.check")
expect_match("${out}" "\\{\"a\":\"x\",\"b\":\\[1,2\\.5,null,true\\]\\}" "json.format")
expect_match("${out}" "[0-9a-f]+-[0-9a-f]+-4[0-9a-f]+-[0-9a-f]+-[0-9a-f]+" "guid.new")
expect_match("${out}" "No profiling data\\." "profile.dump")
expect_match("${err}" "ParseObject unexpected char" "json.check error")
if(NOT rc EQUAL 1)
  message(FATAL_ERROR "a failed json.check must make the script exit 1, got ${rc}")
endif()

# 5. Usage.
execute_process(COMMAND "${KELCON}" --help OUTPUT_VARIABLE out RESULT_VARIABLE rc)
expect_match("${out}" "Usage: kelcon" "--help")
execute_process(COMMAND "${KELCON}" --bogus ERROR_VARIABLE err RESULT_VARIABLE rc)
if(NOT rc EQUAL 2)
  message(FATAL_ERROR "an unknown option must exit 2, got ${rc}")
endif()
