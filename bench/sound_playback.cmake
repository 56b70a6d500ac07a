# Playback of a one-hour stereo document through the virtual device.
find_package(benchmark REQUIRED)
add_executable(bench_sound_playback ${CMAKE_CURRENT_LIST_DIR}/sound_playback.cpp)
target_include_directories(bench_sound_playback PRIVATE ${PROJECT_SOURCE_DIR})
target_link_libraries(bench_sound_playback PRIVATE velm benchmark::benchmark PkgConfig::SNDFILE)
