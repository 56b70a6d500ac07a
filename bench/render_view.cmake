# Drawing speed of the audio view renderer on a one-hour stereo document.
find_package(benchmark REQUIRED)
add_executable(bench_render_waveform ${CMAKE_CURRENT_LIST_DIR}/render_waveform.cpp)
target_include_directories(bench_render_waveform PRIVATE ${PROJECT_SOURCE_DIR})
target_link_libraries(bench_render_waveform PRIVATE velm Qt6::Gui benchmark::benchmark PkgConfig::SNDFILE)
