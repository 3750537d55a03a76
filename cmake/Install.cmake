# What is installed, and how other projects find it; the components are packages of their own, see cmake/Packages.cmake. The installed tree can be moved as a whole: nothing in it holds an
# absolute path.
include(CMakePackageConfigHelpers)

set(headerDir ${CMAKE_INSTALL_INCLUDEDIR}/ZORLyra)
set(packageDir ${CMAKE_INSTALL_LIBDIR}/cmake/ZORLyra)

# The default platform looks for its resources beside its own directory, in ../share/ZORLyra, and one folder further up,
# since on some systems its directory is one of lib for the processor's kind.
set(resourceDir share/ZORLyra)

file(RELATIVE_PATH binToLib /prefix/${CMAKE_INSTALL_BINDIR} /prefix/${CMAKE_INSTALL_LIBDIR})
set(libraries ZORFoundation ZORDefaultPlatform ZORLyra)
if(ZOR_WITH_TOOLKIT)
  list(APPEND libraries ZORClashToolkit)
endif()
set_target_properties(${libraries} PROPERTIES INSTALL_RPATH "$ORIGIN")

install(TARGETS ZORPlatformDeclarations ${libraries} EXPORT ZORLyraTargets
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT libraries
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT libraries NAMELINK_COMPONENT development
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT development)
if(TARGET lyra)
  set_target_properties(lyra PROPERTIES INSTALL_RPATH "$ORIGIN/${binToLib}")
  install(TARGETS lyra RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT command)
endif()

if(WIN32)
  install(FILES ${ZOR_COMPILER_LIBRARIES} DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT libraries)
endif()

install(DIRECTORY include/ DESTINATION ${headerDir} COMPONENT development FILES_MATCHING PATTERN "*.h")
install(DIRECTORY src/platform/ DESTINATION ${headerDir}/platform COMPONENT development FILES_MATCHING PATTERN "*.h")
install(FILES src/default_platform/InterferenceScene.h src/default_platform/OpenModel.h
  src/default_platform/SettingOverride.h DESTINATION ${headerDir}/default_platform COMPONENT development)
if(ZOR_WITH_TOOLKIT)
  # Not those of the CAD kernel's part, which is loaded by name, and of the toolkit's own sources.
  install(DIRECTORY src/toolkit/ DESTINATION ${headerDir}/toolkit COMPONENT development FILES_MATCHING PATTERN "*.h"
    REGEX "/detection/(kernel|DetectionTask|ProductTree|Viewpoints)" EXCLUDE
    REGEX "/exchange/(bcf/(BcfNames|BcfPictures|BcfTopics|BcfWords)|sheets/(SheetBase|SheetRows)|DocumentTimes|ExchangeLibrary|ExchangeXml|XmlText)[.]h$" EXCLUDE
    REGEX "/publishing/(folder|page|pictures|viewer)$" EXCLUDE
    REGEX "/records/ElementWalk[.]h$" EXCLUDE
    REGEX "/review/(Assignment|Frames|HashInput|LanguageWords|PlaceClusters|ProductMatch|ReviewSource|TomlFile)[.]h$" EXCLUDE)
  install(FILES ${PROJECT_BINARY_DIR}/generated/ZORToolkitExport.h DESTINATION ${headerDir} COMPONENT development)
endif()
install(FILES ${PROJECT_BINARY_DIR}/generated/ZORLyraExport.h ${PROJECT_BINARY_DIR}/generated/ZORPlatformExport.h
  DESTINATION ${headerDir} COMPONENT development)
install(DIRECTORY resources/ DESTINATION ${resourceDir} COMPONENT libraries OPTIONAL)

install(EXPORT ZORLyraTargets NAMESPACE ZORLyra:: DESTINATION ${packageDir} COMPONENT development)
configure_package_config_file(cmake/ZORLyraConfig.cmake.in ${PROJECT_BINARY_DIR}/generated/ZORLyraConfig.cmake
  INSTALL_DESTINATION ${packageDir})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/generated/ZORLyraConfigVersion.cmake
  COMPATIBILITY SameMinorVersion)
install(FILES ${PROJECT_BINARY_DIR}/generated/ZORLyraConfig.cmake
  ${PROJECT_BINARY_DIR}/generated/ZORLyraConfigVersion.cmake
  DESTINATION ${packageDir} COMPONENT development)

file(RELATIVE_PATH pcToPrefix /prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig /prefix)
string(REGEX REPLACE "/$" "" pcToPrefix "${pcToPrefix}")
configure_file(cmake/zorlyra.pc.in ${PROJECT_BINARY_DIR}/generated/zorlyra.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/generated/zorlyra.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)

# Scripts for schedulers.
install(PROGRAMS tools/cluster/lyra-cluster DESTINATION ${resourceDir}/cluster COMPONENT command)
install(FILES tools/cluster/lyra.condor DESTINATION ${resourceDir}/cluster COMPONENT command)
