# Puts the demo's files into the program, so that it needs none of its own beside it.
foreach(name IN ITEMS records.json mgb850.map orders.csv)
  set(file ${PROJECT_SOURCE_DIR}/samples/mgb850/${name})
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${file})
  file(READ ${file} demo_${name})
endforeach()
configure_file(${CMAKE_CURRENT_LIST_DIR}/demo_files.cpp.in ${PROJECT_BINARY_DIR}/demo_files.cpp @ONLY)
target_sources(partnerkit_cli PRIVATE ${PROJECT_BINARY_DIR}/demo_files.cpp)
