# Cost of the catalogue's answers to document events.
add_executable(bench_persist_catalog ${CMAKE_CURRENT_LIST_DIR}/persist_catalog.cpp)
target_include_directories(bench_persist_catalog PRIVATE ${PROJECT_SOURCE_DIR} ${PROJECT_SOURCE_DIR}/tests/support)
target_link_libraries(bench_persist_catalog PRIVATE velm benchmark::benchmark PkgConfig::SNDFILE)
