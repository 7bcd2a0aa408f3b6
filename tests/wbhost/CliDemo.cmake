# Runs the real wbhost executable: its demo on the bundled examples, and the project, edit and
# program commands as a user types them (repeated options, host options after the subcommand).

include(${CMAKE_CURRENT_LIST_DIR}/RunWbhost.cmake)

file(REMOVE_RECURSE ${SCRATCH})
file(MAKE_DIRECTORY ${SCRATCH})

# The whole session, every step as it should be.
run_wbhost(0 demo --examples ${EXAMPLES} --workdir ${SCRATCH}/demo)
expect_all("${OUT}" "== 1. Load and check KestrelK40.xml" "tolerated difference"
           "Tangent I/O item \"Valve\"" "renamed /Connector1" "Backup: conflict" "demo: all " " steps gave what they should")
string(FIND "${OUT}" "NOT as expected" at)
if(NOT at EQUAL -1)
  message(FATAL_ERROR "a demo step failed yet the demo exited 0:\n${OUT}")
endif()
run_wbhost(1 demo --examples ${SCRATCH}/nowhere)
expect_all("${ERR}" "does not hold the example descriptions")

# The commands one by one; host options may come after the subcommand.
set(project ${SCRATCH}/p.wbproj)
run_wbhost(0 project new ${project} --target K40=${EXAMPLES}/KestrelK40.xml
           --target K20=${EXAMPLES}/KestrelK20.xml)
expect_all("${OUT}" "target \"K40\"" "target \"K20\"")
run_wbhost(1 project new ${project})
run_wbhost(0 project add-item ${project} --target K20 --resource Connector0/DIO1 --name Pump)
run_wbhost(0 edit ${project} K20 rename Connector0/DIO1 PumpLine)
expect_all("${OUT}" "renamed /Connector0/DIO1 to \"PumpLine\"" "Tangent I/O item \"Pump\"")
run_wbhost(usage edit ${project} K20 rename Connector0/DIO1)
expect_all("${ERR}" "usage: edit PROJECT TARGET rename NODE NEWNAME")
run_wbhost(0 project list ${project})
# The item followed its resource to its new name.
expect_all("${OUT}" "from ${project}.K20.xml" "resource=/Connector0/PumpLine" "bound")

file(WRITE ${SCRATCH}/answers.txt "# the user picks DIO5\nselect-resource:0=0\nselect-resource:1=text:DIO5\n")
run_wbhost(0 program TIOSelectResourceDialog.gx --answers ${SCRATCH}/answers.txt
           --answer select-resource:2=1 --record)
expect_all("${OUT}" "1 = \"DIO5\"" "2 = 1" "-- program runs" "TIOSelectResourceDialog.gx (select-resource)")
run_wbhost(1 --answer nosuch:0=1 project list ${project})
expect_all("${ERR}" "answer \"nosuch:0=1\": no program behaviour has that name")

run_wbhost(0 --help)
expect_all("${OUT}" "project" "edit" "program" "demo" "--answers" "--record")
