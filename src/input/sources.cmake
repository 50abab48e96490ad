list(APPEND MORVEL_INPUT_LOGIC
  ${CMAKE_CURRENT_LIST_DIR}/oxidationentry.h
  ${CMAKE_CURRENT_LIST_DIR}/oxidationtable.h
  ${CMAKE_CURRENT_LIST_DIR}/oxidationtable.cpp
  ${CMAKE_CURRENT_LIST_DIR}/atomtypes.h
  ${CMAKE_CURRENT_LIST_DIR}/atomtypes.cpp
  ${CMAKE_CURRENT_LIST_DIR}/cifrewrite.h
  ${CMAKE_CURRENT_LIST_DIR}/cifrewrite.cpp
  ${CMAKE_CURRENT_LIST_DIR}/inputpaths.h
  ${CMAKE_CURRENT_LIST_DIR}/inputpaths.cpp
  ${CMAKE_CURRENT_LIST_DIR}/filereplace.h
  ${CMAKE_CURRENT_LIST_DIR}/filereplace.cpp)
list(APPEND MORVEL_INPUT_DIALOG
  ${CMAKE_CURRENT_LIST_DIR}/getinputfile.cpp
  ${CMAKE_CURRENT_LIST_DIR}/oxidationtablefile.cpp
  ${CMAKE_CURRENT_LIST_DIR}/addoxidationnumbers.cpp)
