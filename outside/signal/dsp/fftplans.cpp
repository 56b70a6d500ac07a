#include "outside/signal/dsp/fftplans_internal.hpp"

#include <map>
#include <mutex>
#include <new>
#include <utility>

namespace velmsig {
namespace {

struct PlanCache {
    std::mutex planner;  // guards FFTW's planner and the map
    std::map<int, std::shared_ptr<const FFTPlan>> plans;
};

// Never destroyed: processors may outlive static destruction at exit.
PlanCache &cache()
{
    static PlanCache *instance = new PlanCache;
    return *instance;
}

std::shared_ptr<const FFTPlan> make_plan_locked(int length)
{
    FFTBuffers scratch(length);
    if (!scratch)
        return nullptr;
    // Estimated plans take a millisecond or two to make (measured ones take
    // hundreds) and are the same on every run, so spectra are reproducible.
    fftwf_plan plan = fftwf_plan_dft_r2c_1d(length, scratch.real.get(), scratch.spectrum.get(),
                                            FFTW_ESTIMATE);
    if (!plan)
        return nullptr;
    try {
        return std::make_shared<const FFTPlan>(length, plan);
    } catch (const std::bad_alloc &) {
        fftwf_destroy_plan(plan);  // not yet owned; the lock is already held
        return nullptr;
    }
}

}  // namespace

FFTBuffers::FFTBuffers(int length)
    : real(static_cast<float *>(fftwf_malloc(sizeof(float) * length))),
      spectrum(static_cast<fftwf_complex *>(fftwf_malloc(sizeof(fftwf_complex) * (length / 2 + 1))))
{
}

FFTPlan::~FFTPlan()
{
    std::lock_guard lock(cache().planner);
    fftwf_destroy_plan(plan);
}

std::shared_ptr<const FFTPlan> fft_plan(int length)
{
    PlanCache &c = cache();
    std::lock_guard lock(c.planner);
    auto found = c.plans.find(length);
    if (found != c.plans.end())
        return found->second;
    auto plan = make_plan_locked(length);
    if (plan) {
        try {
            c.plans.emplace(length, plan);
        } catch (const std::bad_alloc &) {
            // Not kept for reuse, but still good for this caller.
        }
    }
    return plan;
}

void prepare_fft_plans(int smallest, int largest)
{
    for (int length = smallest; length <= largest; length *= 2)
        fft_plan(length);
}

void release_fft_plans()
{
    std::map<int, std::shared_ptr<const FFTPlan>> dropped;
    {
        std::lock_guard lock(cache().planner);
        dropped.swap(cache().plans);
    }
    // The plans die here, outside the lock their destructor takes.
}

}  // namespace velmsig
