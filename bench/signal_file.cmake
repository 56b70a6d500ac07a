# Reading and saving speed of the signal library's file part.  The internal
# reader interface is hidden in the shared library, so the part's sources are
# built in.
find_package(benchmark REQUIRED)
set(VELMSIGNAL_SOURCES)
include(${PROJECT_SOURCE_DIR}/outside/signal/file/sources.cmake)
add_executable(bench_signal_file ${VELMSIGNAL_SOURCES} ${CMAKE_CURRENT_LIST_DIR}/signal_file_read.cpp)
target_include_directories(bench_signal_file PRIVATE ${PROJECT_SOURCE_DIR})
target_link_libraries(bench_signal_file PRIVATE benchmark::benchmark PkgConfig::SNDFILE PkgConfig::SOXR Threads::Threads)
