// Library start-up and shut-down, shared by the process attach hook and by
// VELM_Initialize / VELM_Finalize through one counter.
#include "core/startup_internal.hpp"

#include "core/velmaudio.h"
#include "core/velmconfig.h"
#include "outside/signal/audioformat.h"
#include "outside/signal/dspb.h"
#include "sound/velmsound.h"
#include "widgets/graph/velmgraph.h"

namespace {

unsigned startup_counter = 0;

void start_services()
{
    BLCORE_Initialize();
    DSPB_Initialize();
    AUDIO_Initialize();
    BLSETTINGS_ChangeEx(nullptr, "dspb.fftw.prepare_plans=1");
    BLVERSION_Register("libvelm", VELM_VERSION_MAJOR, VELM_VERSION_MINOR, VELM_VERSION_RELEASE, VELM_VERSION_BUILD);
    VELMCONFIG_ResetConfiguration();
    VELMGRAPHDRAW_SetDefaultSettings();
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.playback.devicename=default");
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.record.devicename=default");
}

void stop_services()
{
    AUDIO_Finalize();
    DSPB_Finalize();
    BLCORE_Finalize();
    VELMSOUND_Finalize();
}

} // namespace

namespace velm {

void process_attach()
{
    VELM_Initialize();
}

void process_detach()
{
    if (startup_counter == 0) return;
    startup_counter = 0;
    stop_services();
}

} // namespace velm

int VELM_Initialize(void)
{
    if (startup_counter == 0) start_services();
    ++startup_counter;
    return 1;
}

void VELM_Finalize(void)
{
    if (startup_counter == 0) return;
    if (--startup_counter == 0) stop_services();
}
