# Regions and region files.  The core needs nothing of the other parts (its
# tests build it in); the signal calls reach regions through the store.
set(VELMSIGNAL_REGION_CORE
  ${CMAKE_CURRENT_LIST_DIR}/regionset.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_content.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_api.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_io.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_labels.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_own.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_wave.cpp
  ${CMAKE_CURRENT_LIST_DIR}/region_file.cpp)
list(APPEND VELMSIGNAL_SOURCES ${VELMSIGNAL_REGION_CORE}
  ${CMAKE_CURRENT_LIST_DIR}/signal_region_api.cpp)
