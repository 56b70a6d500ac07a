# DSP routines: windows, power spectra, decibels, mel scale, splines, vectors.
list(APPEND VELMSIGNAL_SOURCES
  ${CMAKE_CURRENT_LIST_DIR}/fftlength.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fftplans.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fftproc.cpp
  ${CMAKE_CURRENT_LIST_DIR}/windows.cpp
  ${CMAKE_CURRENT_LIST_DIR}/decibels.cpp
  ${CMAKE_CURRENT_LIST_DIR}/mels.cpp
  ${CMAKE_CURRENT_LIST_DIR}/spline.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fvector.cpp)
