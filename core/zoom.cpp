// The visible window, its limits, and the amplitude and frequency ranges.
#include <algorithm>
#include <cmath>

#include "core/document_internal.hpp"
#include "core/velmnavigation.h"
#include "outside/signal/audiosignal.h"

namespace {

constexpr int64_t kMinimumWindow = 4;
constexpr double kStepFraction = 0.1;
constexpr float kVerticalBound = 32768.0f;
constexpr float kMinimumSpectralSpan = 10.0f;

bool loaded(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state;
}

int64_t sample_count(VELMAUDIO doc)
{
    return AUDIOSIGNAL_NumSamples(doc->signal);
}

float nyquist(VELMAUDIO doc)
{
    _audio_format format;
    if (!AUDIOSIGNAL_GetFormat(doc->signal, &format)) return 0.0f;
    return static_cast<float>(format.sampleRate) * 0.5f;
}

// A computed position as a sample, saturating where it leaves the 64-bit range.
int64_t to_position(double value)
{
    return static_cast<int64_t>(std::clamp(std::trunc(value), -9.2e18, 9.2e18));
}

int send(VELMAUDIO doc, uint32_t code, void *data1, void *data2)
{
    return BLNOTIFY_SendEvent(doc->dispatcher, nullptr, 0, code, data1, data2);
}

} // namespace

int64_t VELMAUDIO_ViewBegin(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->viewBegin : -1;
}

int64_t VELMAUDIO_ViewEnd(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->viewEnd : -1;
}

int64_t VELMAUDIO_ViewLength(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->viewEnd - doc->state->viewBegin : 0;
}

int64_t VELMAUDIO_ViewBeginLimit(VELMAUDIO doc)
{
    return doc && doc->state ? doc->state->zoomLowerLimit : 0;
}

int64_t VELMAUDIO_ViewEndLimit(VELMAUDIO doc)
{
    if (!doc || !doc->state) return 0;
    if (doc->state->zoomUpperLimit >= 0) return doc->state->zoomUpperLimit;
    return doc->signal ? sample_count(doc) : 0;
}

int64_t VELMAUDIO_ViewLengthLimit(VELMAUDIO doc)
{
    return VELMAUDIO_ViewEndLimit(doc) - VELMAUDIO_ViewBeginLimit(doc);
}

int VELMAUDIO_Zoom(VELMAUDIO doc, int64_t a, int64_t b)
{
    if (!loaded(doc)) return 0;
    int64_t lo = std::max(std::min(a, b), VELMAUDIO_ViewBeginLimit(doc));
    int64_t hi = std::min(std::max(a, b), VELMAUDIO_ViewEndLimit(doc));
    if (lo == hi) return 0;
    // hi < lo first: a request wholly outside the limits must not be subtracted.
    if (hi < lo || hi - lo < kMinimumWindow || (lo == doc->state->viewBegin && hi == doc->state->viewEnd)) return 1;
    if (!send(doc, 0x20014, &lo, &hi)) return 0;
    if (lo == hi) return 0;
    doc->state->viewBegin = lo;
    doc->state->viewEnd = hi;
    VELMSTATE_NotifyChanges(doc, 0);
    send(doc, 0x20015, &lo, &hi);
    return 1;
}

int VELMAUDIO_ZoomArea(VELMAUDIO doc, int64_t a, float top, int64_t b, float bottom)
{
    const int horizontal = VELMAUDIO_Zoom(doc, a, b);
    const int vertical = VELMAUDIO_ZoomVertical(doc, top, bottom);
    return horizontal && vertical;
}

int VELMAUDIO_ZoomReset(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    return VELMAUDIO_Zoom(doc, VELMAUDIO_ViewBeginLimit(doc), VELMAUDIO_ViewEndLimit(doc));
}

int VELMAUDIO_ZoomFullReset(VELMAUDIO doc)
{
    const int window = VELMAUDIO_ZoomReset(doc);
    const int vertical = VELMAUDIO_ZoomVerticalReset(doc);
    const int spectral = VELMAUDIO_ZoomSpectralReset(doc);
    return window && vertical && spectral;
}

int VELMAUDIO_ZoomOffset(VELMAUDIO doc, int64_t offset)
{
    if (!loaded(doc)) return 0;
    if (offset == 0) return 1;
    const VELMSTATE *s = doc->state;
    int64_t delta;
    if (offset < 0) {
        const int64_t limit = VELMAUDIO_ViewBeginLimit(doc);
        if (s->viewBegin <= limit) return 0;
        delta = std::max(offset, limit - s->viewBegin);
    } else {
        const int64_t limit = VELMAUDIO_ViewEndLimit(doc);
        if (s->viewEnd >= limit) return 0;
        delta = std::min(offset, limit - s->viewEnd);
    }
    return VELMAUDIO_Zoom(doc, s->viewBegin + delta, s->viewEnd + delta);
}

void VELMAUDIO_ZoomByFactor(VELMAUDIO doc, int64_t centre, double factor)
{
    if (!loaded(doc) || !std::isfinite(factor)) return;
    const double begin = static_cast<double>(doc->state->viewBegin);
    const double end = static_cast<double>(doc->state->viewEnd);
    const int64_t new_begin = to_position(begin + (static_cast<double>(centre) - begin) * factor);
    const int64_t new_end = to_position(end - (end - static_cast<double>(centre)) * factor);
    VELMAUDIO_Zoom(doc, new_begin, new_end);
}

static int step_zoom(VELMAUDIO doc, int direction)
{
    if (!loaded(doc)) return 0;
    const VELMSTATE *s = doc->state;
    if (VELMAUDIO_CursorVisible(doc)) {
        const int64_t before_begin = s->viewBegin, before_end = s->viewEnd;
        VELMAUDIO_ZoomByFactor(doc, s->cursor.position, kStepFraction * direction);
        return doc->state->viewBegin != before_begin || doc->state->viewEnd != before_end;
    }
    const auto step = static_cast<int64_t>(std::trunc(static_cast<double>(s->viewEnd - s->viewBegin) * kStepFraction));
    return VELMAUDIO_Zoom(doc, s->viewBegin + step * direction, s->viewEnd - step * direction);
}

int VELMAUDIO_ZoomIn(VELMAUDIO doc)
{
    return step_zoom(doc, 1);
}

int VELMAUDIO_ZoomOut(VELMAUDIO doc)
{
    return step_zoom(doc, -1);
}

static int centre_on(VELMAUDIO doc, int64_t c)
{
    const int64_t length = doc->state->viewEnd - doc->state->viewBegin;
    const int64_t half = length / 2;
    int64_t begin = c - half, end;
    if (begin < 0) {
        begin = 0;
        end = length;
    } else {
        end = c + half;
    }
    const int64_t count = sample_count(doc);
    if (end > count) {
        begin = count - length;
        end = count;
    }
    return VELMAUDIO_Zoom(doc, begin, end);
}

int VELMAUDIO_ZoomCursor(VELMAUDIO doc)
{
    return loaded(doc) ? centre_on(doc, doc->state->cursor.position) : 0;
}

int VELMAUDIO_ZoomPlayCursor(VELMAUDIO doc)
{
    return loaded(doc) ? centre_on(doc, doc->state->playCursor.position) : 0;
}

int VELMAUDIO_SetZoomLimits(VELMAUDIO doc, int64_t a, int64_t b)
{
    if (!loaded(doc)) return 0;
    int64_t lo = a, hi = b;
    if (b >= 1) {
        lo = std::min(a, b);
        hi = std::max(a, b);
    }
    if (!send(doc, 0x20016, &lo, &hi)) return 0;
    const int64_t lower_limit = lo < 0 ? 0 : lo, upper_limit = std::min(hi, sample_count(doc));
    // Limits that leave no part of the signal would lock the window for good.
    if (upper_limit >= 0 && lower_limit >= upper_limit) return 0;
    VELMSTATE *s = doc->state;
    s->zoomLowerLimit = lower_limit;
    s->zoomUpperLimit = upper_limit;
    const int zoomed = VELMAUDIO_Zoom(doc, s->zoomLowerLimit, s->zoomUpperLimit);
    VELMSTATE_NotifyChanges(doc, 0);
    int64_t lower = doc->state->zoomLowerLimit, upper = doc->state->zoomUpperLimit;
    send(doc, 0x20017, &lower, &upper);
    return zoomed;
}

int VELMAUDIO_ResetZoomLimits(VELMAUDIO doc)
{
    return VELMAUDIO_SetZoomLimits(doc, 0, -1);
}

int VELMAUDIO_SetZoomLimitsToView(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    return VELMAUDIO_SetZoomLimits(doc, doc->state->viewBegin, doc->state->viewEnd);
}

int VELMAUDIO_CanZoomIn(VELMAUDIO doc)
{
    return loaded(doc) && VELMAUDIO_ViewLength(doc) > kMinimumWindow;
}

int VELMAUDIO_HasZoom(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    return doc->state->viewBegin != VELMAUDIO_ViewBeginLimit(doc) || doc->state->viewEnd != VELMAUDIO_ViewEndLimit(doc);
}

int VELMAUDIO_CanZoomOut(VELMAUDIO doc)
{
    return VELMAUDIO_HasZoom(doc);
}

int VELMAUDIO_HasZoomLimit(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    return VELMAUDIO_ViewBeginLimit(doc) != 0 || VELMAUDIO_ViewEndLimit(doc) != sample_count(doc);
}

int VELMAUDIO_ZoomVertical(VELMAUDIO doc, float a, float b)
{
    if (!loaded(doc)) return 0;
    float lo = std::max(std::min(a, b), -kVerticalBound);
    float hi = std::min(std::max(a, b), kVerticalBound);
    // Also refuses NaN and a range wholly outside the bounds, which would turn inside out.
    if (!(lo < hi)) return 0;
    VELMSTATE *s = doc->state;
    if (lo == static_cast<float>(s->vertMin) && hi == static_cast<float>(s->vertMax)) return 1;
    if (!send(doc, 0x20018, &hi, &lo)) return 0;
    doc->state->vertMax = hi;
    doc->state->vertMin = lo;
    VELMSTATE_NotifyChanges(doc, 0);
    send(doc, 0x20019, &hi, &lo);
    return 1;
}

int VELMAUDIO_ZoomVerticalReset(VELMAUDIO doc)
{
    return VELMAUDIO_ZoomVertical(doc, -1.0f, 1.0f);
}

int VELMAUDIO_ZoomVerticalFactor(VELMAUDIO doc, double factor)
{
    if (!loaded(doc)) return 0;
    return VELMAUDIO_ZoomVertical(doc, static_cast<float>(doc->state->vertMax * factor),
                                  static_cast<float>(doc->state->vertMin * factor));
}

int VELMAUDIO_ZoomVerticalOut(VELMAUDIO doc)
{
    return VELMAUDIO_ZoomVerticalFactor(doc, 1.1);
}

int VELMAUDIO_ZoomVerticalIn(VELMAUDIO doc)
{
    return VELMAUDIO_ZoomVerticalFactor(doc, 0.9);
}

int VELMAUDIO_ScrollVertical(VELMAUDIO doc, float delta)
{
    if (!loaded(doc)) return 0;
    return VELMAUDIO_ZoomVertical(doc, static_cast<float>(doc->state->vertMax + delta),
                                  static_cast<float>(doc->state->vertMin + delta));
}

int VELMAUDIO_ZoomSpectral(VELMAUDIO doc, float a, float b)
{
    if (!loaded(doc)) return 0;
    float lo = std::max(std::min(a, b), 0.0f);
    float hi = std::min(std::max(a, b), nyquist(doc));
    VELMSTATE *s = doc->state;
    if (lo == static_cast<float>(s->spectralMin) && hi == static_cast<float>(s->spectralMax)) return 1;
    if (!(hi - lo >= kMinimumSpectralSpan)) return 0; // NaN included
    if (!send(doc, 0x2001A, &lo, &hi)) return 0;
    doc->state->spectralMin = lo;
    doc->state->spectralMax = hi;
    VELMSTATE_NotifyChanges(doc, 0);
    send(doc, 0x2001B, &lo, &hi);
    return 1;
}

int VELMAUDIO_ZoomSpectralReset(VELMAUDIO doc)
{
    if (!loaded(doc)) return 0;
    return VELMAUDIO_ZoomSpectral(doc, 0.0f, nyquist(doc));
}

int VELMAUDIO_ZoomSpectralFactor(VELMAUDIO doc, double factor)
{
    if (!loaded(doc)) return 0;
    const VELMSTATE *s = doc->state;
    const double span = (s->spectralMax - s->spectralMin) * factor;
    if (span < kMinimumSpectralSpan) return 0;
    const double lo = (s->spectralMin == 0.0 || span / 2 >= s->spectralMin) ? 0.0 : s->spectralMin - span / 2;
    return VELMAUDIO_ZoomSpectral(doc, static_cast<float>(lo), static_cast<float>(lo + span));
}

int VELMAUDIO_ZoomSpectralFactorAround(VELMAUDIO doc, float centre, double factor)
{
    if (!loaded(doc)) return 0;
    const VELMSTATE *s = doc->state;
    if (centre < s->spectralMin || centre > s->spectralMax) return 0;
    return VELMAUDIO_ZoomSpectral(doc, static_cast<float>(s->spectralMin + (centre - s->spectralMin) * (1 - factor)),
                                  static_cast<float>(s->spectralMax - (s->spectralMax - centre) * (1 - factor)));
}

int VELMAUDIO_ScrollSpectral(VELMAUDIO doc, float delta)
{
    if (!loaded(doc)) return 0;
    const VELMSTATE *s = doc->state;
    double d = delta;
    if (s->spectralMin + d < 0) d = -s->spectralMin;
    if (s->spectralMax + d > nyquist(doc)) d = nyquist(doc) - s->spectralMax;
    return VELMAUDIO_ZoomSpectral(doc, static_cast<float>(s->spectralMin + d), static_cast<float>(s->spectralMax + d));
}
