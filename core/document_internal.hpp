// The audio document record behind a VELMAUDIO handle.  Private to the library.
#ifndef VELM_DOCUMENT_INTERNAL_HPP
#define VELM_DOCUMENT_INTERNAL_HPP

#include <cstdint>

#include "core/velmaudio.h"

struct VELMCUSTOMTRACK {
    int32_t id;
    uint8_t inUse;
    char    name[VELM_TRACKNAME_SIZE];
};

struct _VELMAUDIO {
    BLMEM        pool;         // "VELMAUDIO Data Memory": the record lives here
    VELMSTATE   *state;
    AUDIOSIGNAL *signal;
    struct VELMUNDOSTACK *undo; // undo stack, created on first use
    struct _VELMDRAW *renderer; // created at the first draw
    void        *player;       // linked, not owned
    void        *recorder;     // linked, not owned
    BLNOTIFY     dispatcher;
    uint32_t     options;      // OPTION_*
    BLSETTINGS   settings;     // overlays the global settings while drawing
    uint8_t      settingsActive;
    char         fileName[VELM_FILENAME_SIZE];
    char         fileFormat[VELM_FORMAT_SIZE];
    char         formatLabel[256];
    char         regionsFileName[VELM_FILENAME_SIZE];
    char         regionsFileFormat[VELM_FORMAT_SIZE];
    uint32_t     formatCapabilities;
    uint64_t     savedStamp;   // signal change stamp at the last load or save
    uint64_t     fileStamp;    // file modification stamp at the last load, save or link
    int32_t      references;
    int32_t      customTrackCount;
    VELMCUSTOMTRACK customTracks[VELM_MAX_CUSTOM_TRACKS];
    BLMUTEX      referenceLock;
    uint8_t      drawing;      // a draw is in progress
    uint8_t      closeQuery;   // the last reference's close is being asked of the handlers
    uint8_t      closeAfterDraw; // closed from a handler while drawing: torn down when the draw ends
};

namespace velm {

// Copies text into a fixed buffer, cutting it to fit.
void copy_text(char *buffer, size_t size, const char *text);

// The signal library's error mapped to the document layer's codes.
int map_signal_error(int signal_error);

} // namespace velm

#endif
