/* The public headers compile as C, and the basic calls work from C. */
#include "core/velmaudio.h"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmtimeconv.h"
#include "core/velmtimer.h"
#include "core/velmutil.h"
#include "core/velmversion.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmselection.h"
#include "sound/velmplay.h"

#include <stdio.h>
#include <string.h>

static int failures = 0;

#define CHECK(cond)                                                   \
    do {                                                              \
        if (!(cond)) {                                                \
            fprintf(stderr, "%s:%d: %s\n", __FILE__, __LINE__, #cond); \
            ++failures;                                               \
        }                                                             \
    } while (0)

int main(void)
{
    int major = 0;
    _audio_format format;
    VELMAUDIO doc;
    char text[32];

    CHECK(VELM_Initialize() == 1);
    VELMVERSION_Number(&major, NULL, NULL, NULL);
    CHECK(major == 2);

    format = AUDIO_InitFormat(8000, 1, 16);
    doc = VELMAUDIO_New(&format);
    CHECK(doc != NULL);
    CHECK(AUDIOSIGNAL_AppendSilence(VELMAUDIO_GetAudioSignal(doc), 8000) == 8000);
    CHECK(VELMAUDIO_ZoomReset(doc) == 1);
    CHECK(VELMAUDIO_ViewEnd(doc) == 8000);
    CHECK(VELMAUDIO_Zoom(doc, 1000, 2000) == 1);
    CHECK(VELMAUDIO_ViewLength(doc) == 1000);
    CHECK(VELMAUDIO_TimeToSample(doc, 0.5) == 4000);
    CHECK(VELMAUDIO_SampleToTimeString(doc, 4000, text, sizeof text) == 1);
    CHECK(strcmp(text, "0.500") == 0);
    CHECK(VELMAUDIO_AddCustomTrack(doc, "words") == 1);
    CHECK(VELMAUDIO_IsPlaying(doc) == 0);
    CHECK(VELMAUDIO_PlayStart(doc, VELMPLAY_MODE_SELECTIONS, 0, 0) == 0);
    CHECK(VELMPLAY_GetInputFormat(NULL).sampleRate == 0);
    CHECK(VELMAUDIO_Close(doc) == 1);
    CHECK(VELMAUDIO_Close(NULL) == 0);
    VELM_Finalize();

    return failures ? 1 : 0;
}
