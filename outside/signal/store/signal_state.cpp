// Saved states and block-list handles for the undo history.
#include <cstring>

#include "outside/signal/store/signal_internal.hpp"

using namespace velmsig;

extern "C" {

int AUDIOSIGNAL_SaveState(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE *state)
{
    if (!signal || !state) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    std::memset(state, 0, sizeof *state);
    std::lock_guard<std::mutex> guard(signal->lock);
    std::lock_guard<std::mutex> lists(list_lock());
    state->numChannels = int32_t(signal->lists.size());
    state->sampleRate = signal->format.sampleRate;
    state->numSamples = signal->lists[0]->segments->length();
    for (size_t c = 0; c < signal->lists.size(); ++c) {
        ++signal->lists[c]->holds;
        state->blocksList[c] = signal->lists[c];
    }
    return 1;
}

int AUDIOSIGNAL_RestoreState(AUDIOSIGNAL *signal, AUDIOSIGNAL_STATE *state)
{
    if (!signal || !state || state->numChannels != signal->format.numChannels) {
        set_last_error(AUDIO_ERROR_BAD_ARGUMENT);
        return 0;
    }
    std::vector<SegmentsPtr> saved;
    for (int c = 0; c < state->numChannels; ++c) saved.push_back(state->blocksList[c]->segments);
    {
        std::unique_lock<std::shared_mutex> writer(signal->access);
        install_segments(*signal, saved);
    }
    return AUDIOSIGNAL_ClearState(state);
}

int AUDIOSIGNAL_ClearState(AUDIOSIGNAL_STATE *state)
{
    if (!state || state->numChannels < 0 || state->numChannels > AUDIOSIGNAL_MAX_CHANNELS) return 0;
    {
        std::lock_guard<std::mutex> lists(list_lock());
        for (int c = 0; c < state->numChannels; ++c) {
            _audio_blocks_list *list = state->blocksList[c];
            if (--list->holds == 0 && !list->in_use) delete list;
        }
    }
    std::memset(state, 0, sizeof *state);
    return 1;
}

AUDIOBLOCKSLIST *AUDIOSIGNAL_GetChannelBlocksList(AUDIOSIGNAL *signal, int channel)
{
    if (!valid_channel(signal, channel)) return nullptr;
    std::lock_guard<std::mutex> guard(signal->lock);
    return signal->lists[size_t(channel)];
}

int AUDIOBLOCKSLIST_Desactive(AUDIOBLOCKSLIST *list)
{
    return list ? 1 : 0;
}

int AUDIOBLOCKSLIST_Destroy(AUDIOBLOCKSLIST *list)
{
    return list ? 1 : 0;
}

int64_t AUDIOBLOCKSLIST_SizeInMemory(const AUDIOBLOCKSLIST *list)
{
    return list ? list_memory_share(*list) : 0;
}

int64_t AUDIOBLOCKSLIST_NumSamples(const AUDIOBLOCKSLIST *list)
{
    return list ? list->segments->length() : 0;
}

}  // extern "C"
