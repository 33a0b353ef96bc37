# What `cmake --install` puts where: the plug-in and the stand-in host libraries in lib/, their
# headers under include/, the console in bin/, the demo board and data in share/orvnebu/ (where
# the console looks, relative to itself), a CMake package and pkg-config files.
include(CMakePackageConfigHelpers)

# Fixed, not the platform's multiarch folder: the console finds the plug-in at ../lib.
set(NEBU_INSTALL_BINDIR bin)
set(NEBU_INSTALL_LIBDIR lib)
set(NEBU_INSTALL_INCLUDEDIR include)
set(NEBU_INSTALL_DATADIR share/orvnebu)
set(NEBU_INSTALL_CMAKEDIR ${NEBU_INSTALL_LIBDIR}/cmake/OrvNebu)

set(NEBU_HOST_TARGETS OrvUtil OrvJtag OrvCore nebu_board)
if(NOT WIN32)
  # Each library finds its neighbours beside itself, the console finds them in ../lib.
  set_target_properties(orvnebu ${NEBU_HOST_TARGETS} PROPERTIES INSTALL_RPATH "$ORIGIN")
  if(TARGET nebu)
    set_target_properties(nebu PROPERTIES INSTALL_RPATH "$ORIGIN/../${NEBU_INSTALL_LIBDIR}")
  endif()
endif()

# The plug-in's header is <orvnebu/orvnebu.h>; the host headers keep the paths they have in this
# tree ("host/OrvCore.h", "hostsim/Sim.h") below include/orvnebu.
install(TARGETS orvnebu EXPORT OrvNebuTargets
  RUNTIME DESTINATION ${NEBU_INSTALL_BINDIR}
  LIBRARY DESTINATION ${NEBU_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${NEBU_INSTALL_LIBDIR}
  INCLUDES DESTINATION ${NEBU_INSTALL_INCLUDEDIR})
install(TARGETS ${NEBU_HOST_TARGETS} EXPORT OrvNebuTargets
  RUNTIME DESTINATION ${NEBU_INSTALL_BINDIR}
  LIBRARY DESTINATION ${NEBU_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${NEBU_INSTALL_LIBDIR}
  INCLUDES DESTINATION ${NEBU_INSTALL_INCLUDEDIR}/orvnebu)
set_target_properties(nebu_board PROPERTIES EXPORT_NAME Board)

install(FILES ${CMAKE_SOURCE_DIR}/include/orvnebu/orvnebu.h
        DESTINATION ${NEBU_INSTALL_INCLUDEDIR}/orvnebu)
install(FILES ${CMAKE_SOURCE_DIR}/host/OrvCore.h ${CMAKE_SOURCE_DIR}/host/OrvExport.h
              ${CMAKE_SOURCE_DIR}/host/OrvJtag.h ${CMAKE_SOURCE_DIR}/host/OrvTypes.h
              ${CMAKE_SOURCE_DIR}/host/OrvUtil.h
        DESTINATION ${NEBU_INSTALL_INCLUDEDIR}/orvnebu/host)
install(FILES ${CMAKE_SOURCE_DIR}/hostsim/Sim.h
        DESTINATION ${NEBU_INSTALL_INCLUDEDIR}/orvnebu/hostsim)
install(FILES ${CMAKE_SOURCE_DIR}/hostsim/board/Board.h
        DESTINATION ${NEBU_INSTALL_INCLUDEDIR}/orvnebu/hostsim/board)

if(TARGET nebu)
  install(TARGETS nebu RUNTIME DESTINATION ${NEBU_INSTALL_BINDIR})
  install(DIRECTORY ${NEBU_SOURCE_DATA_DIR}/ DESTINATION ${NEBU_INSTALL_DATADIR}/data)
  install(DIRECTORY ${NEBU_SOURCE_BOARDS_DIR}/ DESTINATION ${NEBU_INSTALL_DATADIR}/boards)
endif()

install(EXPORT OrvNebuTargets NAMESPACE OrvNebu:: DESTINATION ${NEBU_INSTALL_CMAKEDIR})
configure_package_config_file(${CMAKE_SOURCE_DIR}/cmake/OrvNebuConfig.cmake.in
  ${CMAKE_BINARY_DIR}/cmake/OrvNebuConfig.cmake INSTALL_DESTINATION ${NEBU_INSTALL_CMAKEDIR})
write_basic_package_version_file(${CMAKE_BINARY_DIR}/cmake/OrvNebuConfigVersion.cmake
  COMPATIBILITY SameMinorVersion)
install(FILES ${CMAKE_BINARY_DIR}/cmake/OrvNebuConfig.cmake
              ${CMAKE_BINARY_DIR}/cmake/OrvNebuConfigVersion.cmake
        DESTINATION ${NEBU_INSTALL_CMAKEDIR})

foreach(pc orvnebu orvnebu-host)
  configure_file(${CMAKE_SOURCE_DIR}/cmake/${pc}.pc.in ${CMAKE_BINARY_DIR}/cmake/${pc}.pc @ONLY)
  install(FILES ${CMAKE_BINARY_DIR}/cmake/${pc}.pc DESTINATION ${NEBU_INSTALL_LIBDIR}/pkgconfig)
endforeach()
