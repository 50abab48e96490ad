list(APPEND MORVEL_RUN_LOGIC
  ${CMAKE_CURRENT_LIST_DIR}/runlogic.h
  ${CMAKE_CURRENT_LIST_DIR}/runlogic.cpp)
list(APPEND MORVEL_RUN_DIALOG
  ${CMAKE_CURRENT_LIST_DIR}/childprocess.h
  ${CMAKE_CURRENT_LIST_DIR}/childprocess.cpp
  ${CMAKE_CURRENT_LIST_DIR}/parameterfile.cpp
  ${CMAKE_CURRENT_LIST_DIR}/inputstaging.cpp
  ${CMAKE_CURRENT_LIST_DIR}/runcontroller.cpp
  ${CMAKE_CURRENT_LIST_DIR}/morvelresult.cpp)
