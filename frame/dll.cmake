# BR_Info.dll: entry points and class table (frame/module) over the class libraries,
# with the type library, version block and images as resources. Runtimes are linked
# statically (cmake/mingw-common.cmake), so the DLL depends on system DLLs only.
add_library(BR_Info SHARED
  ${BR_ROOT}/frame/module/dll_entry.cpp
  ${BR_ROOT}/frame/module/class_rows.cpp
  ${BR_ROOT}/resources/BR_Info.rc
  ${BR_ROOT}/resources/BR_Info.def
)
set_target_properties(BR_Info PROPERTIES PREFIX "" OUTPUT_NAME BR_Info)
target_include_directories(BR_Info PRIVATE ${BR_ROOT}/resources)
# windres finds BR_Info.tlb through the generated-headers folder of br_idl.
target_link_libraries(BR_Info PRIVATE
  br_module
  br_com
  br_idl
  br_geo
  br_tide_objects
  br_tide_controls
  br_contours
  br_inspector
  br_legend
  br_picture
)
file(GLOB br_resource_images CONFIGURE_DEPENDS ${BR_ROOT}/resources/images/*)
set_source_files_properties(${BR_ROOT}/resources/BR_Info.rc PROPERTIES
  OBJECT_DEPENDS "${BR_TYPELIB_FILE};${BR_ROOT}/resources/resource.h;${br_resource_images}")
add_dependencies(BR_Info br_idl_files)
target_link_options(BR_Info PRIVATE $<$<CONFIG:Release>:-s>)
if(CMAKE_SIZEOF_VOID_P EQUAL 4)
  # The .def names the undecorated stdcall entry points.
  target_link_options(BR_Info PRIVATE -Wl,--enable-stdcall-fixup)
endif()
