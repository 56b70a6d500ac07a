// How long the catalogue holds up an open or a save: recording a file (a
// write transaction) and recognising a linked file (one look-up).
#include "core/velmaudio.h"
#include "core/velmqueries.h"
#include "persist/velmdb.h"
#include "testaudio.hpp"

#include <benchmark/benchmark.h>

#include <string>
#include <vector>

namespace {

constexpr uint32_t EVENT_LINKED = 0x20001;
constexpr uint32_t EVENT_OPENED = 0x20005;

// A catalogue holding `files` recorded files and one open document.
class Catalogue {
public:
    explicit Catalogue(int files)
    {
        VELMDB_OpenDatabase(dir.file("catalog.db").c_str());
        const auto samples = velmtest::sine(8000, 1, 800);
        for (int i = 0; i < files; ++i) {
            const std::string path = dir.file("f" + std::to_string(i) + ".wav");
            velmtest::write_audio(path, samples, 8000, 1);
            if (VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO")) {
                if (!document) document = doc;
                else VELMAUDIO_Close(doc);
            }
        }
    }
    ~Catalogue()
    {
        VELMAUDIO_Close(document);
        VELMDB_CloseDatabase();
    }
    Catalogue(const Catalogue &) = delete;
    Catalogue &operator=(const Catalogue &) = delete;

    velmtest::TempDir dir;
    VELMAUDIO document = nullptr;
};

void record_open(benchmark::State &state)
{
    Catalogue catalogue(static_cast<int>(state.range(0)));
    int64_t id = -1;
    for (auto _ : state) {
        if (BLNOTIFY_SendEvent(nullptr, nullptr, 0, EVENT_OPENED, catalogue.document, &id) != 1)
            state.SkipWithError("the record failed");
        benchmark::DoNotOptimize(id);
    }
}
BENCHMARK(record_open)->Arg(10)->Arg(1000)->Unit(benchmark::kMicrosecond);

void recognise_link(benchmark::State &state)
{
    Catalogue catalogue(static_cast<int>(state.range(0)));
    int64_t id = -1;
    for (auto _ : state) {
        BLNOTIFY_SendEvent(nullptr, nullptr, 0, EVENT_LINKED, catalogue.document, &id);
        benchmark::DoNotOptimize(id);
    }
    if (id <= 0) state.SkipWithError("the file was not recognised");
}
BENCHMARK(recognise_link)->Arg(10)->Arg(1000)->Unit(benchmark::kMicrosecond);

} // namespace

BENCHMARK_MAIN();
