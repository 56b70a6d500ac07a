# The file part of the signal library: formats, format strings, files,
# metadata and the last error.
list(APPEND VELMSIGNAL_SOURCES
  ${CMAKE_CURRENT_LIST_DIR}/audiofile_api.cpp
  ${CMAKE_CURRENT_LIST_DIR}/convert_reader.cpp
  ${CMAKE_CURRENT_LIST_DIR}/direct_pcm.cpp
  ${CMAKE_CURRENT_LIST_DIR}/formats.cpp
  ${CMAKE_CURRENT_LIST_DIR}/formatstring.cpp
  ${CMAKE_CURRENT_LIST_DIR}/lasterror.cpp
  ${CMAKE_CURRENT_LIST_DIR}/link.cpp
  ${CMAKE_CURRENT_LIST_DIR}/metadata.cpp
  ${CMAKE_CURRENT_LIST_DIR}/open_reader.cpp
  ${CMAKE_CURRENT_LIST_DIR}/progress.cpp
  ${CMAKE_CURRENT_LIST_DIR}/sample16.cpp
  ${CMAKE_CURRENT_LIST_DIR}/sfmap.cpp
  ${CMAKE_CURRENT_LIST_DIR}/sndfile_reader.cpp
  ${CMAKE_CURRENT_LIST_DIR}/sndfile_writer.cpp
  ${CMAKE_CURRENT_LIST_DIR}/vfile.cpp)
