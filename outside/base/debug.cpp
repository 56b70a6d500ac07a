/* The log: nothing is written until the host picks a file or a sink. */
#include "outside/base/blbase.h"
#include "outside/base/base_internal.h"

#include <cstdio>
#include <mutex>
#include <string>

namespace {

struct LogState {
    std::mutex lock;
    int level = BLDEBUG_LEVEL_INFO;
    FILE *file = nullptr;
    bool file_is_stderr = false;
    BLDEBUG_Sink sink = nullptr;
    void *sink_user = nullptr;
};

LogState &Log()
{
    // Never destroyed: worker threads may still log while the process exits.
    static auto *state = new LogState;
    return *state;
}

const char *KindPrefix(int kind)
{
    switch (kind) {
    case BLDEBUG_KIND_WARNING: return "WARNING: ";
    case BLDEBUG_KIND_ERROR: return "ERROR: ";
    case BLDEBUG_KIND_TERMINAL: return "TERMINAL ERROR: ";
    default: return "";
    }
}

void Emit(int kind, int level, const char *format, va_list args)
{
    LogState &log = Log();
    BLDEBUG_Sink sink;
    void *sink_user;
    {
        std::lock_guard guard(log.lock);
        if (level > log.level || (!log.file && !log.sink)) return;
        sink = log.sink;
        sink_user = log.sink_user;
    }
    std::string message;
    if (!blbase::FormatText(message, format, args)) return;
    while (!message.empty() && message.back() == '\n') message.pop_back();
    {
        std::lock_guard guard(log.lock);
        if (log.file) {
            std::fprintf(log.file, "%s%s\n", KindPrefix(kind), message.c_str());
            std::fflush(log.file);
        }
    }
    // Called unlocked, so a sink may log or change the log itself.
    if (sink) sink(kind, level, message.c_str(), sink_user);
}

void CloseFile(LogState &log)
{
    if (log.file && !log.file_is_stderr) std::fclose(log.file);
    log.file = nullptr;
    log.file_is_stderr = false;
}

} // namespace

// Hands a printf-style call's arguments to Emit.
#define BL_EMIT(kind, level, format)                                                               \
    va_list args;                                                                                  \
    va_start(args, format);                                                                        \
    Emit(kind, level, format, args);                                                               \
    va_end(args)

void BLDEBUG_Log(int level, const char *format, ...)
{
    BL_EMIT(BLDEBUG_KIND_LOG, level, format);
}

void BLDEBUG_Warning(int code, const char *format, ...)
{
    BL_EMIT(BLDEBUG_KIND_WARNING, BLDEBUG_LEVEL_ERROR, format);
}

void BLDEBUG_Error(int code, const char *format, ...)
{
    BL_EMIT(BLDEBUG_KIND_ERROR, BLDEBUG_LEVEL_ERROR, format);
}

void BLDEBUG_TerminalError(int code, const char *format, ...)
{
    BL_EMIT(BLDEBUG_KIND_TERMINAL, BLDEBUG_LEVEL_ERROR, format);
}

void BLDEBUG_SetLevel(int level)
{
    std::lock_guard guard(Log().lock);
    Log().level = level;
}

int BLDEBUG_GetLevel(void)
{
    std::lock_guard guard(Log().lock);
    return Log().level;
}

int BLDEBUG_SetLogFile(const char *path)
{
    LogState &log = Log();
    std::lock_guard guard(log.lock);
    if (!path) {
        CloseFile(log);
        return 1;
    }
    if (std::string(path) == "-") {
        CloseFile(log);
        log.file = stderr;
        log.file_is_stderr = true;
        return 1;
    }
    FILE *file = std::fopen(path, "ae");
    if (!file) return 0;
    CloseFile(log);
    log.file = file;
    return 1;
}

void BLDEBUG_SetSink(BLDEBUG_Sink sink, void *user)
{
    std::lock_guard guard(Log().lock);
    Log().sink = sink;
    Log().sink_user = user;
}
