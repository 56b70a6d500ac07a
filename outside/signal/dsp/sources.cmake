# DSP routines: windows, power spectra, decibels, mel scale, splines, vectors.
set(VELMSIGNAL_DSP_SOURCES
  ${CMAKE_CURRENT_LIST_DIR}/fftlength.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fftplans.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fftproc.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dspinit.cpp
  ${CMAKE_CURRENT_LIST_DIR}/windows.cpp
  ${CMAKE_CURRENT_LIST_DIR}/decibels.cpp
  ${CMAKE_CURRENT_LIST_DIR}/mels.cpp
  ${CMAKE_CURRENT_LIST_DIR}/spline.cpp
  ${CMAKE_CURRENT_LIST_DIR}/fvector.cpp)
# The per-sample and per-bin loops are meant to run as vector code: let the
# compiler weigh vectorising them fully, and let it evaluate comparisons
# unconditionally (nothing here reads floating-point exception flags).
set_source_files_properties(${VELMSIGNAL_DSP_SOURCES} PROPERTIES
  COMPILE_OPTIONS "-fno-trapping-math;-fvect-cost-model=dynamic")
list(APPEND VELMSIGNAL_SOURCES ${VELMSIGNAL_DSP_SOURCES})
