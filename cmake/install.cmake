# Installs the shared library, the public headers (by folder, under include/xalscript), a CMake
# package (find_package(XALScript) -> XALScript::xalscript) and a pkg-config file.
include(CMakePackageConfigHelpers)

foreach(f ${XAL_FOLDERS})
  install(DIRECTORY ${PROJECT_SOURCE_DIR}/${f}/ DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/xalscript/${f}
          FILES_MATCHING PATTERN "*.h" PATTERN "internal" EXCLUDE)
endforeach()
install(FILES ${PROJECT_SOURCE_DIR}/include/xalscript/xalscript.h DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/xalscript)

foreach(f ${XAL_FOLDERS})
  install(TARGETS xal_${f} EXPORT XALScriptTargets)
endforeach()
install(TARGETS xalscript xalhost EXPORT XALScriptTargets
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
        RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/host/ DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/xalscript/host
        FILES_MATCHING PATTERN "*.h")
install(EXPORT XALScriptTargets NAMESPACE XALScript:: DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/XALScript)

file(WRITE ${CMAKE_CURRENT_BINARY_DIR}/XALScriptConfig.cmake.in [=[
@PACKAGE_INIT@
include(CMakeFindDependencyMacro)
find_dependency(PkgConfig)
pkg_check_modules(ICU REQUIRED IMPORTED_TARGET icu-uc icu-i18n)
find_dependency(SQLite3)
include("${CMAKE_CURRENT_LIST_DIR}/XALScriptTargets.cmake")
]=])
configure_package_config_file(${CMAKE_CURRENT_BINARY_DIR}/XALScriptConfig.cmake.in
  ${CMAKE_CURRENT_BINARY_DIR}/XALScriptConfig.cmake INSTALL_DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/XALScript)
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/XALScriptConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/XALScriptConfig.cmake ${CMAKE_CURRENT_BINARY_DIR}/XALScriptConfigVersion.cmake
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/XALScript)

file(WRITE ${CMAKE_CURRENT_BINARY_DIR}/xalscript.pc.in [=[
prefix=@CMAKE_INSTALL_PREFIX@
libdir=${prefix}/@CMAKE_INSTALL_LIBDIR@
includedir=${prefix}/@CMAKE_INSTALL_INCLUDEDIR@

Name: xalscript
Description: Document logic component of an ERP system
Version: @PROJECT_VERSION@
Requires.private: icu-uc icu-i18n
Libs: -L${libdir} -lxalscript
Cflags: -I${includedir}/xalscript -I${includedir} -std=c++20
]=])
configure_file(${CMAKE_CURRENT_BINARY_DIR}/xalscript.pc.in ${CMAKE_CURRENT_BINARY_DIR}/xalscript.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/xalscript.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
