# The loadable module a host opens: it exports only its four entry points.
add_library(GenericExcelVantrel MODULE module/exports.cpp module/registration.cpp)
vantrel_warnings(GenericExcelVantrel)
set_target_properties(GenericExcelVantrel PROPERTIES PREFIX "" OUTPUT_NAME GenericExcelVantrel)
# The class object first: it refers to the bridge, which comes after it.
target_link_libraries(GenericExcelVantrel PRIVATE vantrel_module_state vantrel_bridge
  registry zerinfl ${CMAKE_DL_LIBS})
target_link_options(GenericExcelVantrel PRIVATE
  -Wl,--version-script=${CMAKE_CURRENT_SOURCE_DIR}/module/exports.map -Wl,--no-undefined)
set_property(TARGET GenericExcelVantrel APPEND PROPERTY LINK_DEPENDS
  ${CMAKE_CURRENT_SOURCE_DIR}/module/exports.map)
