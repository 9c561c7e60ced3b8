# The target Qrex::Runtime: the library as it was installed, or, where it is not, made of its sources with the project.
if(TARGET Qrex::Runtime)
  return()
endif()
include(CMakeFindDependencyMacro)
find_dependency(Threads)

if(EXISTS "${_qrex_library}/runtime/release")
  set(QREX_RUNTIME built CACHE INTERNAL "")
  add_library(Qrex::Runtime STATIC IMPORTED)
  set_target_properties(Qrex::Runtime PROPERTIES
    IMPORTED_CONFIGURATIONS "Release;Debug"
    IMPORTED_LOCATION_DEBUG "${_qrex_library}/runtime/x64/Debug/libvxObject.a"
    IMPORTED_LOCATION_RELEASE "${_qrex_library}/runtime/x64/Release/libvxObject.a"
    MAP_IMPORTED_CONFIG_RELWITHDEBINFO Release
    MAP_IMPORTED_CONFIG_MINSIZEREL Release)
  target_include_directories(Qrex::Runtime INTERFACE "${_qrex_library}/include")
  target_compile_features(Qrex::Runtime INTERFACE cxx_std_17)
  target_link_libraries(Qrex::Runtime INTERFACE Threads::Threads)
else()
  set(QREX_RUNTIME source CACHE INTERNAL "")
  set(_qrex_runtime "${CMAKE_BINARY_DIR}/qrex/runtime.qrex")
  file(CONFIGURE OUTPUT "${_qrex_runtime}" CONTENT [[
virtualTree = { "@_qrex_sources@" }
$EXPORT_LIB = "out/lib" $EXPORT_TRANSLATED_INCLUDE = "out/include" $EXPORT_UNTRANSLATED_INCLUDE = "out/source"
workspaces = { "Vesk/vxObject" }
systemName = "@CMAKE_SYSTEM_NAME@" platform = "x64"
modernCpp = true compilableText = true
]] @ONLY)
  add_library(qrex_runtime STATIC EXCLUDE_FROM_ALL)
  add_library(Qrex::Runtime ALIAS qrex_runtime)
  set_target_properties(qrex_runtime PROPERTIES OUTPUT_NAME vxObject POSITION_INDEPENDENT_CODE ON)
  target_compile_features(qrex_runtime PUBLIC cxx_std_17)
  target_link_libraries(qrex_runtime PUBLIC Threads::Threads)
  qrex_translate(TARGET qrex_runtime WORKSPACE "${_qrex_runtime}" PROJECT vxObject)
endif()
