list(APPEND VELMSIGNAL_SOURCES
  ${CMAKE_CURRENT_LIST_DIR}/audiofx.cpp
  ${CMAKE_CURRENT_LIST_DIR}/gainfade.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_path.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_script.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_stage.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_fmtconv.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_gain.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_fade.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fx_quantizer.cpp)
