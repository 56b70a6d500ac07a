add_executable(bench_signal_fx ${CMAKE_CURRENT_LIST_DIR}/signal_fx_fmtconv.cpp)
target_link_libraries(bench_signal_fx PRIVATE velmsignal benchmark::benchmark PkgConfig::SOXR)
