# The signal store: chunks, block lists, signals, reading, edits, states, pipes.
list(APPEND VELMSIGNAL_SOURCES
  ${CMAKE_CURRENT_LIST_DIR}/block_file.cpp
  ${CMAKE_CURRENT_LIST_DIR}/chunk.cpp
  ${CMAKE_CURRENT_LIST_DIR}/segments.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_api.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_core.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_edit.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_effect.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_file.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_pipe.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_read.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_state.cpp
  ${CMAKE_CURRENT_LIST_DIR}/signal_stats.cpp
  ${CMAKE_CURRENT_LIST_DIR}/store_config.cpp)
