list(APPEND MORVEL_APP_LOGIC
  ${CMAKE_CURRENT_LIST_DIR}/logstyle.h
  ${CMAKE_CURRENT_LIST_DIR}/numbertext.h
  ${CMAKE_CURRENT_LIST_DIR}/toolconfiguration.h
  ${CMAKE_CURRENT_LIST_DIR}/toolconfiguration.cpp)
list(APPEND MORVEL_APP_DIALOG
  ${CMAKE_CURRENT_LIST_DIR}/import.h
  ${CMAKE_CURRENT_LIST_DIR}/import.cpp
  ${CMAKE_CURRENT_LIST_DIR}/logwindow.h
  ${CMAKE_CURRENT_LIST_DIR}/logwindow.cpp
  ${CMAKE_CURRENT_LIST_DIR}/filedrop.h
  ${CMAKE_CURRENT_LIST_DIR}/filedrop.cpp
  ${CMAKE_CURRENT_LIST_DIR}/readtoolconfiguration.cpp
  ${CMAKE_CURRENT_LIST_DIR}/about.cpp)
