// Time bases: the first sample of every pixel column, on a grid that stays put
// while the view scrolls, and the conversions through them.
#include <algorithm>
#include <cmath>

#include "render/view/drawer_internal.hpp"

namespace velm::view {

bool reserve_time_base(BLMEM pool, VELMTIMEBASE *base, int columns)
{
    const int needed = columns + 1;
    if (needed <= base->capacity) return true;
    auto *positions = static_cast<double *>(BLMEM_New(pool, sizeof(double) * static_cast<size_t>(needed)));
    if (!positions) return false;
    if (base->positions) BLMEM_Delete(pool, base->positions);
    base->positions = positions;
    base->capacity = needed;
    base->count = 0;
    base->step = 0.0;
    return true;
}

namespace {

// Each entry is computed from its index, never accumulated, so a shifted
// time base equals one prepared afresh for the new window.
void fill_positions(VELMTIMEBASE *base)
{
    for (int i = 0; i <= base->count; ++i)
        base->positions[i] = std::min(static_cast<double>(base->origin + i) * base->step, base->limit);
}

} // namespace

bool prepare_time_base(VELMTIMEBASE *base, double start, double end, int columns, int64_t signal_length)
{
    if (start == end || columns < 2 || columns + 1 > base->capacity) {
        BLDEBUG_Log(0, "(VELMDRAW)_PrepareTimeBase: Unable to prepare timebase possible division by zero!");
        return false;
    }
    const auto rounded_start = static_cast<int64_t>(std::llround(start));
    const auto rounded_end = static_cast<int64_t>(std::llround(end));
    if (base->start == rounded_start && base->end == rounded_end && base->count == columns && base->step > 0.0)
        return true;
    base->step = (end - start) / (columns - 1);
    base->limit = std::round(std::max(static_cast<double>(signal_length), end));
    // The start snapped to a whole number of steps keeps the columns on one
    // grid while the view scrolls, so moved columns stay valid.
    base->origin = std::llround(std::round(start) / base->step);
    base->count = columns;
    base->start = rounded_start;
    base->end = rounded_end;
    fill_positions(base);
    return true;
}

void offset_time_base(VELMTIMEBASE *base, int columns, double start, double end, int64_t signal_length)
{
    if (base->count < 1 || base->step <= 0.0) return;
    base->origin += columns;
    base->limit = std::round(std::max(static_cast<double>(signal_length), end));
    base->start = static_cast<int64_t>(std::llround(start));
    base->end = static_cast<int64_t>(std::llround(end));
    fill_positions(base);
}

DataKey key_for(const VELMTIMEBASE *base, uint64_t change_time)
{
    DataKey key;
    key.count = base->count;
    key.start = static_cast<int64_t>(std::llround(base->positions[0]));
    key.end = static_cast<int64_t>(std::llround(base->positions[base->count]));
    key.changeTime = change_time;
    return key;
}

bool key_matches(const DataKey &key, const VELMTIMEBASE *base, uint64_t change_time)
{
    if (!base->positions || base->count < 1) return false;
    const DataKey now = key_for(base, change_time);
    return key.count == now.count && key.start == now.start && key.end == now.end && key.changeTime == now.changeTime;
}

} // namespace velm::view

const VELMTIMEBASE *VELMDRAW_MainTimeBase(VELMDRAW drawer)
{
    return drawer ? &drawer->mainBase : nullptr;
}

const VELMTIMEBASE *VELMDRAW_NavigatorTimeBase(VELMDRAW drawer)
{
    return drawer ? &drawer->navigatorBase : nullptr;
}

double VELMDRAW_TBConvertRealXtoDisplayX(const VELMTIMEBASE *base, double sample)
{
    if (!base || !base->positions || base->step <= 0.0) return -1.0;
    return (sample - base->positions[0]) / base->step;
}

double VELMDRAW_TBConvertDisplayXtoRealX(const VELMTIMEBASE *base, double column)
{
    if (!base || !base->positions || base->step <= 0.0) return -1.0;
    return base->positions[0] + column * base->step;
}

double VELMDRAW_ConvertRealXtoDisplayX(VELMDRAW drawer, double sample)
{
    return VELMDRAW_TBConvertRealXtoDisplayX(VELMDRAW_MainTimeBase(drawer), sample);
}

double VELMDRAW_ConvertDisplayXtoRealX(VELMDRAW drawer, double column)
{
    return VELMDRAW_TBConvertDisplayXtoRealX(VELMDRAW_MainTimeBase(drawer), column);
}
