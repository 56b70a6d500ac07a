// Edits that remove audio: trim, clear and cut.  Later ranges are shifted
// left by what the earlier calls already removed.
#include <utility>
#include <vector>

#include "core/velmnavigation.h"
#include "edit/edit_internal.hpp"

namespace {

constexpr int kBoth = velm::kRecordRegions | velm::kRecordBlocks;

bool has_selections(VELMAUDIO doc)
{
    return doc && doc->signal && doc->state->selections;
}

} // namespace

int VELMAUDIO_Trim(VELMAUDIO doc, const char *label)
{
    if (!has_selections(doc) || !VELMAUDIO_Editable(doc)) return 0;
    const int64_t before = velm::sample_count(doc);
    if (VELMSTATE_SelectionSize(doc, doc->state) >= before) return 0;

    // The ranges are read before anything changes: the edits may rebuild the state.
    std::vector<std::pair<int64_t, int64_t>> keep;
    for (const VELMSELECTION *s = doc->state->selections; s; s = s->next)
        keep.emplace_back(VELMSELECTION_GetBegin(doc, s), VELMSELECTION_GetEnd(doc, s));
    if (!velm::begin_edit(doc, label, "Trim", kBoth)) return 0;

    int flag = velm::kSeries;
    auto clear = [&](int64_t b, int64_t e) {
        const int64_t removed = before - velm::sample_count(doc);
        const bool ok = AUDIOSIGNAL_ClearEx(doc->signal, flag, b - removed, e - removed) != 0;
        flag = 0;
        return ok;
    };
    if (keep.front().first > 0 && !clear(0, keep.front().first)) return velm::roll_back(doc);
    for (size_t i = 1; i < keep.size(); ++i)
        if (!clear(keep[i - 1].second, keep[i].first)) return velm::roll_back(doc);
    const int64_t removed = before - velm::sample_count(doc);
    if (keep.back().second - removed < velm::sample_count(doc) &&
        !AUDIOSIGNAL_ClearEx(doc->signal, flag, keep.back().second - removed, velm::sample_count(doc)))
        return velm::roll_back(doc);
    if (velm::sample_count(doc) != before) VELMAUDIO_SelectAll(doc);
    return velm::finish_edit(doc);
}

int VELMAUDIO_Clear(VELMAUDIO doc, const char *label)
{
    if (!has_selections(doc) || !VELMAUDIO_Editable(doc)) return 0;
    std::vector<std::pair<int64_t, int64_t>> ranges;
    for (const VELMSELECTION *s = doc->state->selections; s; s = s->next)
        ranges.emplace_back(VELMSELECTION_GetBegin(doc, s), VELMSELECTION_GetEnd(doc, s));
    if (!velm::begin_edit(doc, label, "Clear", kBoth)) return 0;
    const int64_t before = velm::sample_count(doc);
    int flag = velm::kSeries;
    for (const auto &[b, e] : ranges) {
        const int64_t removed = before - velm::sample_count(doc);
        if (!AUDIOSIGNAL_ClearEx(doc->signal, flag, b - removed, e - removed)) return velm::roll_back(doc);
        flag = 0;
    }
    VELMAUDIO_SetCursorPosition(doc, ranges.front().first);
    VELMAUDIO_ClearSelection(doc);
    return velm::finish_edit(doc);
}

AUDIOSIGNAL *VELMAUDIO_CutSelectionsEx(VELMAUDIO doc, const VELMSELECTION *list, int option, const char *label)
{
    if (!doc || !doc->signal || !list || !VELMAUDIO_Editable(doc)) return nullptr;
    const int flags = option == 0 ? 0 : (0x100 | (option & 0xFF));
    std::vector<std::pair<int64_t, int64_t>> ranges;
    for (const VELMSELECTION *s = list; s; s = s->next)
        ranges.emplace_back(VELMSELECTION_GetBegin(doc, s), VELMSELECTION_GetEnd(doc, s));
    if (!velm::begin_edit(doc, label, "Cut", kBoth)) return nullptr;
    const int64_t before = velm::sample_count(doc);
    AUDIOSIGNAL *result = nullptr;
    int series = velm::kSeries;
    for (const auto &[b, e] : ranges) {
        const int64_t removed = before - velm::sample_count(doc);
        AUDIOSIGNAL *grown = AUDIOSIGNAL_CutEx(doc->signal, result, flags | series, b - removed, e - removed);
        if (!grown) {
            AUDIOSIGNAL_Destroy(result);
            velm::roll_back(doc);
            return nullptr;
        }
        result = grown;
        series = 0;
    }
    VELMAUDIO_ClearSelection(doc);
    VELMAUDIO_SetCursorPosition(doc, ranges.front().first);
    velm::finish_edit(doc);
    return result;
}

AUDIOSIGNAL *VELMAUDIO_Cut(VELMAUDIO doc, const char *label)
{
    if (!doc || !doc->state || !doc->state->selections) return nullptr;
    return VELMAUDIO_CutSelectionsEx(doc, doc->state->selections, 0, label);
}
