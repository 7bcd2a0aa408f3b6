# What a shell user relies on, through the real executable: exit statuses, --version, tree --check,
# --host-dir, the one way outside files are read, texts the host's code page cannot hold, and
# control characters kept from the terminal.

include(${CMAKE_CURRENT_LIST_DIR}/RunWbhost.cmake)
file(REMOVE_RECURSE ${SCRATCH})
file(MAKE_DIRECTORY ${SCRATCH})

# --version names the host, the module it loaded and the module's answer; usage errors are 64,
# a status no command's answer uses.
run_wbhost(0 --version)
expect_all("${OUT}" "wbhost " "module /" "wbtangio.qxx (GetInfo 5)")
run_wbhost(usage --no-such-option tree ${EXAMPLES}/KestrelK40.xml)
run_wbhost(usage compare ${EXAMPLES}/KestrelK40.xml)
run_wbhost(usage)
run_wbhost(usage tree ${EXAMPLES}/KestrelK40.xml a b)
run_wbhost(0 --help)
expect_all("${OUT}" "Exit status:" "64" "--host-dir" "--version")

# tree --check: one FILE:LINE:COLUMN line a problem (an included file's problem names that
# file), a summary, 0 clean, 1 problems, 2 a file not read.
file(WRITE ${SCRATCH}/bad.xml "<Target name=\"Bad\">\n  <A prototype=\"Nowhere\"/>\n"
                              "  <:Include>missing.xml</:Include>\n</Target>\n")
file(WRITE ${SCRATCH}/broken.xml "<Target name=\"Broken\">\n  <Line>1</Lin>\n</Target>\n")
run_wbhost(0 tree --check ${EXAMPLES}/KestrelK40.xml ${EXAMPLES}/KestrelK20.xml)
expect_all("${OUT}" "0 problems in 2 files")
run_wbhost(1 tree --check ${SCRATCH}/bad.xml ${SCRATCH}/broken.xml)
expect_all("${OUT}" "${SCRATCH}/bad.xml:2:26: error: Unable to find prototype node: Nowhere\n"
           "${SCRATCH}/bad.xml:3:23: error: Unable to find include file node: "
           "${SCRATCH}/broken.xml:2:11: error: mismatched tag\n" "3 problems in 2 files\n")
string(FIND "${OUT}" "<Line>" quoted)
if(NOT quoted EQUAL -1)
  message(FATAL_ERROR "without --context the input is not quoted:\n${OUT}")
endif()
run_wbhost(1 tree --check --context ${SCRATCH}/broken.xml)
expect_all("${OUT}" "error: mismatched tag\n    <Target name=\"Broken\">\n      <Line>1</Lin>\n")
run_wbhost(2 tree --check ${SCRATCH}/broken.xml ${SCRATCH}/absent.xml)
expect_all("${OUT}" "1 problem in 2 files, 1 not read")
expect_all("${ERR}" "absent.xml: No such file or directory")

# --host-dir: includes (the host's loader for tree, the module's for compare) are looked up
# there; without it, beside the executable.
file(MAKE_DIRECTORY ${SCRATCH}/host/parts)
file(WRITE ${SCRATCH}/host/parts/clock.xml "<Clock name=\"Clock\"><Rate>40</Rate></Clock>\n")
file(WRITE ${SCRATCH}/board.xml "<Target name=\"B\">\n  <:Include>parts/clock.xml</:Include>\n</Target>\n")
file(WRITE ${SCRATCH}/inline.xml "<Target name=\"B\">\n  <Clock name=\"Clock\"><Rate>40</Rate></Clock>\n</Target>\n")
run_wbhost(1 tree --check ${SCRATCH}/board.xml)
expect_all("${OUT}" "Unable to find include file node")
run_wbhost(0 --host-dir ${SCRATCH}/host tree ${SCRATCH}/board.xml)
expect_all("${OUT}" "<Clock name=\"Clock\">" "<Rate>40</Rate>")
run_wbhost(1 compare ${SCRATCH}/inline.xml ${SCRATCH}/board.xml)
run_wbhost(0 compare --host-dir ${SCRATCH}/host ${SCRATCH}/inline.xml ${SCRATCH}/board.xml)
run_wbhost(usage --host-dir ${SCRATCH}/no-such-folder tree ${SCRATCH}/board.xml)

# compare --explain: the answer as plain compare gives it, then what decided it, one line each.
file(WRITE ${SCRATCH}/need.xml "<Target name=\"T\"><Rate>40</Rate><Mode name=\"M\">"
     "<SupportedValues>a,b</SupportedValues><MemoryLatency>4</MemoryLatency></Mode></Target>\n")
file(WRITE ${SCRATCH}/more.xml "<Target name=\"T\"><Rate>40</Rate><Extra>yes</Extra><Mode name=\"M\">"
     "<SupportedValues>b,A,c</SupportedValues><MemoryLatency>3</MemoryLatency></Mode></Target>\n")
file(WRITE ${SCRATCH}/slow.xml "<Target name=\"T\"><Rate>40</Rate><Mode name=\"M\">"
     "<SupportedValues>a,b</SupportedValues><MemoryLatency>9</MemoryLatency></Mode></Target>\n")
file(WRITE ${SCRATCH}/rate.xml "<Target name=\"T\"><Rate>41</Rate><Mode name=\"M\">"
     "<SupportedValues>a,b</SupportedValues><MemoryLatency>4</MemoryLatency></Mode></Target>\n")
file(WRITE ${SCRATCH}/few.xml "<Target name=\"T\"><Rate>40</Rate><Mode name=\"M\">"
     "<SupportedValues>a</SupportedValues><MemoryLatency>4</MemoryLatency></Mode></Target>\n")
file(WRITE ${SCRATCH}/bare.xml "<Target name=\"T\"><Rate>40</Rate></Target>\n")
foreach(case "0;need;match" "2;more;/Extra: only the offered description holds this entry; offered \"yes\""
        "1;slow;/M/MemoryLatency: the offered latency is larger than the required one; required \"4\", offered \"9\""
        "1;rate;/Rate: the texts differ; required \"40\", offered \"41\""
        "1;few;/M/SupportedValues: the offered list lacks a required value \"b\"; required \"a,b\", offered \"a\""
        "1;bare;/M: the offered description lacks this entry")
  list(GET case 0 answer)
  list(GET case 1 offered)
  list(GET case 2 reason)
  run_wbhost(${answer} compare ${SCRATCH}/need.xml ${SCRATCH}/${offered}.xml)
  set(plain "${OUT}")
  run_wbhost(${answer} compare --explain ${SCRATCH}/need.xml ${SCRATCH}/${offered}.xml)
  string(FIND "${OUT}" "${plain}" first)
  if(NOT first EQUAL 0)
    message(FATAL_ERROR "--explain answers \"${plain}\" first:\n${OUT}")
  endif()
  string(REGEX MATCHALL "\n  /" lines "${OUT}")
  list(LENGTH lines count)
  if(answer EQUAL 0 AND NOT count EQUAL 0 OR answer EQUAL 1 AND NOT count EQUAL 1)
    message(FATAL_ERROR "a match explains nothing, a shortfall is one line:\n${OUT}")
  endif()
  expect_all("${OUT}" "${reason}")
endforeach()
# A tolerated difference lists every entry that made it so, in walk order.
run_wbhost(2 compare --explain ${SCRATCH}/need.xml ${SCRATCH}/more.xml)
expect_all("${OUT}" "tolerated difference\n  /Extra: only the offered description holds this entry; offered \"yes\"\n"
           "  /M/MemoryLatency: the offered latency is smaller than the required one; required \"4\", offered \"3\"\n"
           "  /M/SupportedValues: the offered list has a different number of values, every required one among them; required \"a,b\", offered \"b,A,c\"\n")
run_wbhost(0 compare --explain --host-dir ${SCRATCH}/host ${SCRATCH}/inline.xml ${SCRATCH}/board.xml)
run_wbhost(1 compare --explain ${SCRATCH}/inline.xml ${SCRATCH}/board.xml)
run_wbhost(1 compare --explain ${EXAMPLES}/KestrelK40.xml ${EXAMPLES}/KestrelK20.xml)
expect_all("${OUT}" "not satisfied\n  /Connector0/DIO4: the offered description lacks this entry\n")

# Only regular files, each refused with its reason before a byte is read: a FIFO would block,
# /dev/zero never end, a folder read as an empty description.
execute_process(COMMAND mkfifo ${SCRATCH}/fifo RESULT_VARIABLE made)
if(made EQUAL 0)
  run_wbhost(3 compare ${SCRATCH}/fifo ${EXAMPLES}/KestrelK40.xml)
  expect_all("${ERR}" "fifo: it is not a regular file")
endif()
run_wbhost(3 compare /dev/zero ${EXAMPLES}/KestrelK40.xml)
expect_all("${ERR}" "/dev/zero: it is not a regular file")
run_wbhost(3 compare ${EXAMPLES}/KestrelK40.xml ${SCRATCH})
expect_all("${ERR}" "it is a folder")
run_wbhost(1 tree /dev/zero)
run_wbhost(1 --answers /dev/zero program TIOGenUniqueName.gx)
expect_all("${ERR}" "cannot read the answer file /dev/zero: it is not a regular file")

# A UTF-16 description with a byte-order mark is its UTF-8 twin.
file(READ ${SCRATCH}/inline.xml utf8)
string(LENGTH "${utf8}" length)
set(utf16 "FFFE")
math(EXPR last "${length} - 1")
foreach(at RANGE ${last})
  string(SUBSTRING "${utf8}" ${at} 1 c)
  string(HEX "${c}" hex)
  string(APPEND utf16 "${hex}00")
endforeach()
string(REGEX REPLACE "(..)" "\\\\x\\1" escaped "${utf16}")
execute_process(COMMAND printf "${escaped}" OUTPUT_FILE ${SCRATCH}/utf16.xml)
run_wbhost(0 compare ${SCRATCH}/inline.xml ${SCRATCH}/utf16.xml)
run_wbhost(0 compare --host-dir ${SCRATCH}/host ${SCRATCH}/utf16.xml ${SCRATCH}/board.xml)

# Characters the host's code page cannot hold are named, never compared as "?".
file(WRITE ${SCRATCH}/nihon.xml "<Target name=\"T\"><DisplayName>日本</DisplayName></Target>\n")
file(WRITE ${SCRATCH}/chuugoku.xml "<Target name=\"T\"><DisplayName>中国</DisplayName></Target>\n")
run_wbhost(3 compare ${SCRATCH}/nihon.xml ${SCRATCH}/chuugoku.xml)
expect_all("${ERR}" "cannot represent U+65E5 '日', U+672C '本'")
run_wbhost(3 compare --explain ${SCRATCH}/nihon.xml ${SCRATCH}/chuugoku.xml)
run_wbhost(0 tree ${SCRATCH}/nihon.xml)
expect_all("${ERR}" "warning: " "U+65E5 '日', U+672C '本'")

# A control character from a file name (or a name, or a message) never reaches the terminal.
string(ASCII 27 esc)
run_wbhost(1 tree "${SCRATCH}/${esc}[31mred.xml")
expect_all("${ERR}" "\\x1B[31mred.xml")
string(FIND "${ERR}" "${esc}" raw)
if(NOT raw EQUAL -1)
  message(FATAL_ERROR "an ESC reached the terminal:\n${ERR}")
endif()
