// Word-wrapped text in a rectangle, built on the text slots.
#include "render/canvas/canvas_internal.h"

#include <cctype>
#include <string>
#include <vector>

namespace {

constexpr const char *kEllipsis = ". . .";

struct Word {
    std::string text;
    int width;
};

struct Line {
    std::string text;
    int width;
};

std::vector<Word> SplitWords(VELMCANVAS canvas, const char *text)
{
    std::vector<Word> words;
    for (const char *p = text; *p;) {
        while (*p && std::isspace(static_cast<unsigned char>(*p))) ++p;
        const char *start = p;
        while (*p && !std::isspace(static_cast<unsigned char>(*p))) ++p;
        if (p > start) {
            std::string word(start, p);
            const int width = VELMCANVAS_TextWidth(canvas, word.c_str());
            words.push_back({std::move(word), width});
        }
    }
    return words;
}

// Greedy filling: a word starts a new line when it would bring the running
// width past the rectangle's width less one space.
std::vector<Line> BreakLines(const std::vector<Word> &words, int box_width, int space_width)
{
    std::vector<Line> lines;
    for (const Word &word : words) {
        if (lines.empty() || box_width - space_width < lines.back().width + word.width) {
            lines.push_back({word.text, word.width});
        } else {
            lines.back().text += ' ';
            lines.back().text += word.text;
            lines.back().width += word.width + space_width;
        }
    }
    return lines;
}

int AlignedX(const _VELMRECT &rect, int text_width, int flags)
{
    switch (flags & 3) {
    case 0: return rect.left + rect.width / 2 - text_width / 2;
    case 2: return rect.left + rect.width - text_width;
    default: return rect.left;
    }
}

} // namespace

int VELMCANVAS_FillRectangleText(VELMCANVAS canvas, const _VELMRECT *rect, const char *text, int flags)
{
    if (!velm::canvas::Usable(canvas) || !rect || !text) return 0;
    const _VELMRECT &box = *rect;
    const int text_height = VELMCANVAS_TextHeight(canvas, text);
    const int text_width = VELMCANVAS_TextWidth(canvas, text);
    const int ellipsis_width = VELMCANVAS_TextWidth(canvas, kEllipsis);
    const bool ellipsis = flags & VELMCANVASTEXT_ELLIPSIS;

    // A text without height cannot be laid out in lines.
    if (text_height <= 0 || box.height <= text_height) return 1;
    if (text_width <= box.width) {
        VELMCANVAS_TextOut(canvas, AlignedX(box, text_width, flags), box.top + box.height / 2 - text_height / 2,
                           text);
        return 1;
    }
    if (box.width <= ellipsis_width) return 1;

    const std::vector<Word> words = SplitWords(canvas, text);
    for (const Word &word : words) {
        if (word.width > box.width) {
            if (ellipsis) {
                VELMCANVAS_TextOut(canvas, box.left - ellipsis_width / 2 + box.width / 2,
                                   box.top + (box.height - text_height) / 2, kEllipsis);
            }
            return 1;
        }
    }

    const std::vector<Line> lines = BreakLines(words, box.width, VELMCANVAS_TextWidth(canvas, " "));
    const int max_lines = box.height / text_height;
    const bool cut = static_cast<int>(lines.size()) > max_lines;
    if (cut && !ellipsis) return 1;

    const int shown = cut ? max_lines - 1 : static_cast<int>(lines.size());
    int y = box.top + (box.height - text_height * (cut ? max_lines : shown)) / 2;
    for (int i = 0; i < shown; ++i, y += text_height) {
        if (!lines[i].text.empty()) VELMCANVAS_TextOut(canvas, AlignedX(box, lines[i].width, flags), y, lines[i].text.c_str());
    }
    if (cut) VELMCANVAS_TextOut(canvas, box.left + box.width / 2 - ellipsis_width / 2, y, kEllipsis);
    return 1;
}
