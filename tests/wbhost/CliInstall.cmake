# Installs the build into a scratch prefix and runs the host from there, from another working
# folder: it must find the module beside its own install (not the build tree), the module's
# programs and the shared descriptions. Then the Debian package must hold the same tree.

include(${CMAKE_CURRENT_LIST_DIR}/RunWbhost.cmake)
file(REMOVE_RECURSE ${SCRATCH})
set(prefix ${SCRATCH}/prefix)
execute_process(COMMAND ${CMAKE_COMMAND} --install ${BUILD} --prefix ${prefix}
                RESULT_VARIABLE rc OUTPUT_QUIET ERROR_VARIABLE err)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "cmake --install failed:\n${err}")
endif()

set(WBHOST ${prefix}/bin/wbhost)
set(examples ${prefix}/share/wbtangio/examples)
file(MAKE_DIRECTORY ${SCRATCH}/elsewhere)
run_wbhost(0 --version)
expect_all("${OUT}" "module ${prefix}/lib/wbtangio/wbtangio.qxx (GetInfo 5)")
run_wbhost(0 tree --check ${examples}/KestrelK40.xml)
run_wbhost(0 demo --examples ${examples} --workdir ${SCRATCH}/elsewhere)
run_wbhost(0 program TIOGenUniqueName.gx --input 0=text:DIO --input "1=list:DIO|DIO1")
expect_all("${OUT}" "DIO2")

find_program(dpkg_deb dpkg-deb)
if(dpkg_deb AND EXISTS ${BUILD}/CPackConfig.cmake)
  execute_process(COMMAND cpack --config ${BUILD}/CPackConfig.cmake -B ${SCRATCH}/package
                  RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err)
  file(GLOB package ${SCRATCH}/package/*.deb)
  if(NOT rc EQUAL 0 OR NOT package)
    message(FATAL_ERROR "cpack made no package:\n${out}\n${err}")
  endif()
  execute_process(COMMAND ${dpkg_deb} -c ${package} OUTPUT_VARIABLE listing)
  expect_all("${listing}" "./usr/bin/wbhost -> ../lib/wbtangio/wbhost"
             "./usr/lib/wbtangio/wbtangio.qxx" "./usr/lib/wbtangio/wbtio/private/TIOGenUniqueName.gx"
             "./usr/lib/wbtangio/shared/KestrelTiming.xml"
             "./usr/share/wbtangio/examples/KestrelK40.xml")
endif()
