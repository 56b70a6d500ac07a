# Region queries, edits and region files on a signal with many regions.
add_executable(bench_signal_region ${CMAKE_CURRENT_LIST_DIR}/signal_region_queries.cpp)
target_link_libraries(bench_signal_region PRIVATE velmsignal benchmark::benchmark)
