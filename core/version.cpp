#include "core/velmversion.h"

#include <cstdio>

const char *VELMVERSION_String(void)
{
    static char text[256];
    std::snprintf(text, sizeof text, "libvelm version %d.%d.%d.%d (built in %s)", VELM_VERSION_MAJOR,
                  VELM_VERSION_MINOR, VELM_VERSION_RELEASE, VELM_VERSION_BUILD, __DATE__);
    return text;
}

void VELMVERSION_Number(int *major, int *minor, int *release, int *build)
{
    if (major) *major = VELM_VERSION_MAJOR;
    if (minor) *minor = VELM_VERSION_MINOR;
    if (release) *release = VELM_VERSION_RELEASE;
    if (build) *build = VELM_VERSION_BUILD;
}
