# What `cmake --install` puts under the prefix, and the names it gives it:
#   bin/vantrel                        a link to the program beside the module
#   LIBDIR/libvantrel-NAME.so.1        the platform libraries a host links
#   LIBDIR/vantrel/                    the module, its dialogs' plug-in, the program
#   include/vantrel/                   the host's headers
#   LIBDIR/cmake/Vantrel/              find_package(Vantrel): Vantrel::NAME targets
#   LIBDIR/pkgconfig/vantrel.pc        the same for pkg-config
# Everything finds its libraries relative to itself ($ORIGIN), so the tree may
# be moved as a whole.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

set(VANTREL_SOVERSION 1)
set(VANTREL_LIBRARY_VERSION ${VANTREL_SOVERSION}.${PROJECT_VERSION_MINOR}.${PROJECT_VERSION_PATCH})
set(VANTREL_PLATFORM_LIBRARIES automation hostseries units shell registry zerinfl)
set(VANTREL_INCLUDE_SUBDIR vantrel)
set(VANTREL_MODULE_SUBDIR ${CMAKE_INSTALL_LIBDIR}/vantrel)
set(VANTREL_CMAKE_SUBDIR ${CMAKE_INSTALL_LIBDIR}/cmake/Vantrel)

foreach(library IN LISTS VANTREL_PLATFORM_LIBRARIES)
  # The project's prefix keeps the names apart from others in a shared folder.
  set_target_properties(${library} PROPERTIES
    OUTPUT_NAME vantrel-${library}
    VERSION ${VANTREL_LIBRARY_VERSION}
    SOVERSION ${VANTREL_SOVERSION}
    EXPORT_NAME ${library}
    INSTALL_RPATH "$ORIGIN" BUILD_WITH_INSTALL_RPATH ON)
  # The source folder's headers while building; the installed ones afterwards.
  get_target_property(headers ${library} INTERFACE_INCLUDE_DIRECTORIES)
  set_target_properties(${library} PROPERTIES INTERFACE_INCLUDE_DIRECTORIES
    "$<BUILD_INTERFACE:${headers}>;$<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}/${VANTREL_INCLUDE_SUBDIR}>")
  get_target_property(folder ${library} SOURCE_DIR)
  install(DIRECTORY ${folder}/include/ DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/${VANTREL_INCLUDE_SUBDIR}
    COMPONENT development)
endforeach()
# The report interface a host asks the bridge for.
install(FILES ${PROJECT_SOURCE_DIR}/src/bridge/vantrel_report.h
  DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/${VANTREL_INCLUDE_SUBDIR}/bridge COMPONENT development)

install(TARGETS ${VANTREL_PLATFORM_LIBRARIES} EXPORT VantrelTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime NAMELINK_COMPONENT development)

# The module, its plug-in and the program share one folder: the program loads
# the module beside it, the module the plug-in beside it. Their libraries lie
# beside them in the build's bin/ and one folder up when installed. One path
# for both: a path rewritten at install would be padded in the build with
# empty entries, which the loader takes for the current folder.
set_target_properties(GenericExcelVantrel GenericExcelVantrelDialogs vantrel PROPERTIES
  INSTALL_RPATH "$ORIGIN:$ORIGIN/.." BUILD_WITH_INSTALL_RPATH ON)
install(TARGETS GenericExcelVantrel GenericExcelVantrelDialogs vantrel
  LIBRARY DESTINATION ${VANTREL_MODULE_SUBDIR} COMPONENT runtime
  RUNTIME DESTINATION ${VANTREL_MODULE_SUBDIR} COMPONENT runtime)
# bin/vantrel links to it; the program finds its module through the link's target.
file(RELATIVE_PATH program_link /prefix/${CMAKE_INSTALL_BINDIR} /prefix/${VANTREL_MODULE_SUBDIR}/vantrel)
file(MAKE_DIRECTORY ${PROJECT_BINARY_DIR}/install)
file(CREATE_LINK ${program_link} ${PROJECT_BINARY_DIR}/install/vantrel SYMBOLIC)
install(FILES ${PROJECT_BINARY_DIR}/install/vantrel DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime)

# find_package(Vantrel): the libraries as Vantrel::NAME and the module's path.
install(EXPORT VantrelTargets NAMESPACE Vantrel:: DESTINATION ${VANTREL_CMAKE_SUBDIR} COMPONENT development)
configure_package_config_file(${PROJECT_SOURCE_DIR}/cmake/VantrelConfig.cmake.in
  ${PROJECT_BINARY_DIR}/install/VantrelConfig.cmake
  INSTALL_DESTINATION ${VANTREL_CMAKE_SUBDIR}
  PATH_VARS VANTREL_MODULE_SUBDIR)
write_basic_package_version_file(${PROJECT_BINARY_DIR}/install/VantrelConfigVersion.cmake
  COMPATIBILITY SameMinorVersion)
install(FILES ${PROJECT_BINARY_DIR}/install/VantrelConfig.cmake ${PROJECT_BINARY_DIR}/install/VantrelConfigVersion.cmake
  DESTINATION ${VANTREL_CMAKE_SUBDIR} COMPONENT development)

# pkg-config: the paths relative to the .pc file's own folder.
file(RELATIVE_PATH VANTREL_PC_PREFIX /prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig /prefix)
string(REGEX REPLACE "/$" "" VANTREL_PC_PREFIX "${VANTREL_PC_PREFIX}")
configure_file(${PROJECT_SOURCE_DIR}/cmake/vantrel.pc.in ${PROJECT_BINARY_DIR}/install/vantrel.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/install/vantrel.pc
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)
