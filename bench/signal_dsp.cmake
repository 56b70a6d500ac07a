# Benchmarks of the DSP routines of the signal library.
if(NOT TARGET benchmark::benchmark)
  find_package(benchmark REQUIRED)
endif()
add_executable(bench_signal_dsp ${CMAKE_CURRENT_LIST_DIR}/signal_dsp_spectra.cpp)
target_link_libraries(bench_signal_dsp PRIVATE velmsignal benchmark::benchmark)
