# The Python package over the C library, complete in a folder of the build: its members are made from the table.
find_package(Python3 COMPONENTS Interpreter)
if(NOT Python3_FOUND)
  message(STATUS "There is no Python 3: the Python package is not built")
  return()
endif()
set(python_package ${CMAKE_BINARY_DIR}/python/talutil)
file(MAKE_DIRECTORY ${python_package})
set(python_modules ${python_package}/members.py)
add_custom_command(
  OUTPUT ${python_package}/members.py
  COMMAND talutil list --json > ${python_package}/members.json
  COMMAND Python3::Interpreter ${CMAKE_SOURCE_DIR}/python/generate.py < ${python_package}/members.json
          > ${python_package}/members.py
  COMMAND ${CMAKE_COMMAND} -E rm ${python_package}/members.json
  DEPENDS talutil python/generate.py
  COMMENT "Writing the members of the Python package")
foreach(module __init__ library values)
  add_custom_command(
    OUTPUT ${python_package}/${module}.py
    COMMAND ${CMAKE_COMMAND} -E copy ${CMAKE_SOURCE_DIR}/python/talutil/${module}.py ${python_package}/${module}.py
    DEPENDS python/talutil/${module}.py)
  list(APPEND python_modules ${python_package}/${module}.py)
endforeach()
add_custom_target(python_package ALL DEPENDS ${python_modules})
add_dependencies(python_package talutil_c)
install(FILES ${python_modules} DESTINATION lib/python3/dist-packages/talutil)
