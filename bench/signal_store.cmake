add_executable(bench_signal_store ${CMAKE_CURRENT_LIST_DIR}/signal_store_hour.cpp)
target_link_libraries(bench_signal_store PRIVATE velmsignal benchmark::benchmark PkgConfig::SNDFILE)
