# Runs wbhost tree and wbhost compare on the bundled examples and checks what they print and
# how they exit.

include(${CMAKE_CURRENT_LIST_DIR}/RunWbhost.cmake)

# The whole board: prototype copies with their variables, both connectors, the link, the included
# timing part, the host set and the localized name with its language list.
run_wbhost(0 tree ${EXAMPLES}/KestrelK40.xml)
expect_all("${OUT}" "<Target name=\"KestrelK40\">" "<Connector name=\"Connector1\">"
           "<DigitalLine name=\"DIO7\">" "<Line>7</Line>" "<DisplayName>DIO7</DisplayName>"
           "<:Link name=\"ExternalClock\">Connector0/DIO0</:Link>"
           "<TimingEngine name=\"Timing\">" "<FPGAHostSet name=\"FPGAHostSet\">"
           "fra=Carte d'E/S Kestrel K-40")
if(NOT ERR STREQUAL "")
  message(FATAL_ERROR "the example should load without problems:\n${ERR}")
endif()

# One node, found through the path given.
run_wbhost(0 tree ${EXAMPLES}/KestrelK40.xml AnalogInputs/AI2)
expect_all("${OUT}" "<AnalogChannel name=\"AI2\">" "<Channel>2</Channel>")
string(FIND "${OUT}" "AI3" at)
if(NOT at EQUAL -1)
  message(FATAL_ERROR "the dump of AI2 shows more than AI2:\n${OUT}")
endif()

run_wbhost(1 tree ${EXAMPLES}/KestrelK40.xml Connector0/DIO8)
expect_all("${ERR}" "no node at \"Connector0/DIO8\"")

# A broken description: its problems on stderr, what loaded still dumped, a failing exit.
file(MAKE_DIRECTORY ${SCRATCH})
file(WRITE ${SCRATCH}/broken.xml "<Target name=\"Broken\">\n  <Line>1</Lin>\n</Target>\n")
run_wbhost(1 tree ${SCRATCH}/broken.xml)
expect_all("${ERR}" "broken.xml:2:11: error: mismatched tag")
expect_all("${OUT}" "<Target name=\"Broken\">")

run_wbhost(1 tree ${SCRATCH}/missing.xml)
expect_all("${ERR}" "cannot read")

# The three answers of a comparison.
run_wbhost(0 compare ${EXAMPLES}/KestrelK40.xml ${EXAMPLES}/KestrelK40.xml)
expect_all("${OUT}" "match")
run_wbhost(2 compare ${EXAMPLES}/KestrelK40.xml ${EXAMPLES}/KestrelK40X.xml)
expect_all("${OUT}" "tolerated difference")
run_wbhost(1 compare ${EXAMPLES}/KestrelK40.xml ${EXAMPLES}/KestrelK20.xml)
expect_all("${OUT}" "not satisfied")
# Directional: the bigger board asks for what the K-40 lacks.
run_wbhost(1 compare ${EXAMPLES}/KestrelK40X.xml ${EXAMPLES}/KestrelK40.xml)

run_wbhost(0 --help)
expect_all("${OUT}" "tree" "compare" "--module")
