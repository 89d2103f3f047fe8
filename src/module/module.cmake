# The loadable module a host opens: it exports only its four entry points.
add_library(GenericExcelVantrel MODULE
  module/exports.cpp module/class_factory.cpp module/registration.cpp)
vantrel_warnings(GenericExcelVantrel)
set_target_properties(GenericExcelVantrel PROPERTIES PREFIX "" OUTPUT_NAME GenericExcelVantrel)
target_link_libraries(GenericExcelVantrel PRIVATE vantrel_bridge vantrel_module_state
  registry zerinfl ${CMAKE_DL_LIBS})
# The dialogs come from their plug-in, loaded when first asked for: the module
# itself never needs Qt or X.
add_dependencies(GenericExcelVantrel GenericExcelVantrelDialogs)
target_link_options(GenericExcelVantrel PRIVATE
  -Wl,--version-script=${CMAKE_CURRENT_SOURCE_DIR}/module/exports.map -Wl,--no-undefined)
set_property(TARGET GenericExcelVantrel APPEND PROPERTY LINK_DEPENDS
  ${CMAKE_CURRENT_SOURCE_DIR}/module/exports.map)
