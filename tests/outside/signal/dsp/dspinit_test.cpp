// Start-up and shut-down of the DSP routines.
#include "spectrum_helpers.hpp"

#include "outside/base/blbase.h"

#include <gtest/gtest.h>

#include <vector>

using dsptest::Proc;

TEST(SignalDspStartup, ProcessorsOutliveTheLastFinalize)
{
    ASSERT_TRUE(BLSETTINGS_ChangeEx(nullptr, "dspb.fftw.prepare_plans=1"));
    ASSERT_EQ(DSPB_Initialize(), 1);
    ASSERT_EQ(DSPB_Initialize(), 1);  // nested
    Proc before(DSPB_FFTProcCreate(1024));
    DSPB_Finalize();
    DSPB_Finalize();
    DSPB_Finalize();  // one too many does nothing
    Proc after(DSPB_FFTProcCreate(1024));
    ASSERT_TRUE(before && after);

    const auto x = dsptest::sine(1024, 0.7, 37, 1024);
    std::vector<float> a(513), b(513);
    ASSERT_EQ(DSPB_FFTProcExecutePSD(before.get(), x.data(), a.data()), 513);
    ASSERT_EQ(DSPB_FFTProcExecutePSD(after.get(), x.data(), b.data()), 513);
    EXPECT_EQ(a, b);
    BLSETTINGS_DeleteEx(nullptr, "dspb.fftw.prepare_plans");
}
