// The defaults of every "libvelm." setting, registered in a fixed order at start-up.
#include "core/velmconfig.h"

namespace {

struct ColorDefault {
    const char *key;
    uint32_t value;
};

// Colours are stored as the signed decimal text of the 32-bit word.
const ColorDefault kDrawColors[] = {
    {"windowbgcolor", 0x404000}, {"roundbordercolor", 0x282800}, {"appborderbrush", 0xBDCCCE},
    {"innerbordercolor", 0x000000}, {"outerbordercolor", 0x606000}, {"kindseparatormiddlecolor", 0x303000},
    {"scalelinepen", 0x303020}, {"scaletickpen", 0x7F7F7F}, {"waveformbggradienttopbegin", 0x404000},
    {"waveformbggradienttopend", 0x000000}, {"waveformbggradientbottombegin", 0x000000},
    {"waveformbggradientbottomend", 0x404000}, {"spectralformbgbrush", 0x000000}, {"scalebgbrush", 0x282800},
    {"zerolinepen", 0x00007F}, {"inactivezerolinepen", 0x20203F}, {"analogwaveformpen", 0x005680},
    {"digitalwaveformpen", 0x0098EC}, {"digitalwaveformcontourpen", 0x005680}, {"inactivewaveformpen", 0x808080},
    {"inactivewaveformcontourpen", 0x404000}, {"customtrackbggradienttopbegin", 0x404000},
    {"customtrackbggradienttopend", 0x606000}, {"customtrackbggradientbottombegin", 0x606000},
    {"customtrackbggradientbottomend", 0x606000}, {"customtrackbgbrush", 0x606000},
    {"defaulttransparency", 0x30FFFFFF}, {"darktransparency", 0x80000000}, {"redtransparency", 0x500000FF},
    {"greentransparency", 0x20FFFF00}, {"whitetransparency", 0x80FFFFFF},
};

const ColorDefault kCursorColors[] = {
    {"maincursor.activecolor", 0xA0FFFFFF}, {"maincursor.inactivecolor", 0x0000FFFF},
};

const ColorDefault kRegionColors[] = {
    {"regionbackgroundgradientbegin", 0x404020}, {"regionbackgroundgradientend", 0x808040},
    {"regionbordercolor", 0x484848}, {"selectedregionbordercolor", 0xFFFFFF}, {"regionfocusbordercolor", 0xB0B0B0},
};

const ColorDefault kFontColors[] = {
    {"scaleFont.Color", 0x7F7F7F}, {"scaleFont.InactiveColor", 0x3F3F3F},
    {"selectorfont.color", 0xFFFFFF}, {"selectorfont.inactivecolor", 0xFFFFFF},
    {"selectinglabelfont.color", 0xFFFFE0}, {"selectinglabelfont.inactivecolor", 0x7F303020},
    {"selectinglabelinfofont.color", 0xFFFFE0}, {"selectinglabelinfofont.inactivecolor", 0x7F303020},
    {"display.gradient.on.0", 0x000000}, {"display.gradient.on.1", 0x202000}, {"display.gradient.on.2", 0x404000},
    {"display.gradient.off.0", 0x000000}, {"display.gradient.off.1", 0x101000}, {"display.gradient.off.2", 0x202000},
    {"display.font.color", 0x0098EC}, {"display.font.inactivecolor", 0x303020},
    {"display.editfont.color", 0x005680}, {"display.editfont.inactivecolor", 0x303020},
    {"display.infofont.color", 0x005680}, {"display.infofont.inactivecolor", 0x303020},
    {"display.audioformatfont.color", 0x005680}, {"display.audioformatfont.inactivecolor", 0x303020},
};

struct Preset {
    const char *name;
    int winsize;
    const char *colorscheme;
};

const Preset kPresets[] = {{"narrow", 256, "grayscale"}, {"wide", 40, "grayscale"}, {"custom", 40, "ce2k"}};

void draw_color(const ColorDefault &c)
{
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.%s=%d", c.key, static_cast<int>(c.value));
}

void register_presets()
{
    for (const Preset &p : kPresets) {
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.fftlen=%d", p.name, 256);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.winsize=%d", p.name, p.winsize);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.normalize=%d", p.name, 1);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.dynrange=%d", p.name, 110);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.min_dynrange=%d", p.name, 60);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.max_dynrange=%d", p.name, 130);
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.preemphcoef=%s", p.name, "0.9");
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.wintype=%s", p.name, "blackman");
        BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.%s.colorscheme=%s", p.name, p.colorscheme);
    }
}

void register_font(const char *font, const char *family, double size)
{
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.%s.familyname=%s", font, family);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.%s.properties=%d", font, 0);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.%s.color=%d", font, 0xFFFFFF);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.%s.inactivecolor=%d", font, 0xFFFFFF);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.%s.size=%f", font, size);
}

} // namespace

int VELMCONFIG_ResetConfiguration(void)
{
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.general.msscaleframeduration=%d", 20);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.preset=%s", "narrow");
    register_presets();
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.horzscalekind=%s", "time");
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.vertscalekind=%s", "sample");
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.specscalekind=%s", "hz");
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.hovertime=%d", 500);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.AudioDragActive=%s", "true");
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.lowgraphicsdetails=%d", 0);
    for (const ColorDefault &c : kDrawColors) draw_color(c);
    for (const ColorDefault &c : kCursorColors) draw_color(c);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.maincursor.drawshadow=%d", 1);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.maincursor.drawslider=%d", 1);
    draw_color({"playcursor.activecolor", 0xE01921FF});
    draw_color({"playcursor.inactivecolor", 0x001921FF});
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.playcursor.drawshadow=%d", 0);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.playcursor.drawslider=%d", 1);
    for (const ColorDefault &c : kRegionColors) draw_color(c);
    register_font("regiontextfont", "Tahoma", 10.0);
    register_font("phonetictextfont", "Doulos SIL", 16.0);
    for (const ColorDefault &c : kFontColors) draw_color(c);
    return 1;
}
