# The target oru_header_check compiles every hand-written header of the library on its own.
include_guard(GLOBAL)

file(GLOB_RECURSE headers CONFIGURE_DEPENDS RELATIVE "${PROJECT_SOURCE_DIR}"
    "${PROJECT_SOURCE_DIR}/oru/*.h")
set(units "")
foreach(header IN LISTS headers)
    string(MAKE_C_IDENTIFIER "${header}" unit)
    set(unit "${PROJECT_BINARY_DIR}/header_check/${unit}.cpp")
    file(CONFIGURE OUTPUT "${unit}" CONTENT "#include \"${header}\"\n")
    list(APPEND units "${unit}")
endforeach()
add_library(oru_header_check OBJECT EXCLUDE_FROM_ALL ${units})
target_link_libraries(oru_header_check PRIVATE oru deps::boost TBB::tbb)
