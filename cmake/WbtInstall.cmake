# Installing wbhost and the module as people install tools, and a Debian package of them.
#
# The host keeps everything that works together in one folder, lib/wbtangio (its host folder):
# wbhost, the module beside it (where an installed wbhost looks for it first), the module's
# programs in wbtio/private and the shared descriptions that descriptions include. bin/wbhost is
# a link to it: the host's folder is where the executable really is, so includes, programs and
# the module are found from any working folder. The examples go to share/wbtangio/examples.

if(NOT TARGET wbhost OR NOT TARGET wbtangio)
  return()
endif()

set(wbt_host_folder lib/wbtangio)
install(TARGETS wbhost RUNTIME DESTINATION ${wbt_host_folder})
install(TARGETS wbtangio LIBRARY DESTINATION ${wbt_host_folder})
file(GLOB wbt_install_programs ${PROJECT_SOURCE_DIR}/programs/*.gx)
install(FILES ${wbt_install_programs} DESTINATION ${wbt_host_folder}/wbtio/private)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/examples/shared DESTINATION ${wbt_host_folder})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/wbhost/gxlib DESTINATION ${wbt_host_folder})
file(GLOB wbt_install_examples ${PROJECT_SOURCE_DIR}/examples/*.xml)
install(FILES ${wbt_install_examples} DESTINATION share/wbtangio/examples)
install(FILES ${PROJECT_SOURCE_DIR}/README.md DESTINATION share/doc/wbtangio)

# The link in bin, relative so that the installed tree can move (a staging folder, a package).
file(MAKE_DIRECTORY ${PROJECT_BINARY_DIR}/install-links)
file(CREATE_LINK ../${wbt_host_folder}/wbhost ${PROJECT_BINARY_DIR}/install-links/wbhost SYMBOLIC)
install(FILES ${PROJECT_BINARY_DIR}/install-links/wbhost DESTINATION bin)

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME wbtangio)
set(CPACK_PACKAGE_VENDOR "wbtangio")
set(CPACK_PACKAGE_CONTACT "wbtangio developers <wbtangio@localhost>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY
    "Tangent I/O plug-in module with wbhost, an embedded host that loads and drives it")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION devel)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_PACKAGE_DIRECTORY ${PROJECT_BINARY_DIR}/package)
include(CPack)
