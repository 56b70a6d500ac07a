// The library's picture set as drawing code: every picture has a name (its
// handle without the "Img_" prefix, and its file name without ".png") and a
// function that draws it.  The generator writes them as PNG files; the tests
// compare the committed files with what these functions draw.
#pragma once

#include <QImage>

#include <span>

namespace velm::pictures {

struct PictureSpec {
    const char *name;
    QImage (*draw)();
};

// All pictures, in the order of their handles.
std::span<const PictureSpec> AllPictures();

// Region frame pieces (frames.cpp).  A plain frame is the bevel and drop
// shadow around an unselected region; a selected one glows instead.
enum class FrameLook { Plain, Selected };
enum class FramePiece {
    RoundTopLeft, RoundTopRight, RoundBottomLeft, RoundBottomRight, RoundLeft, RoundRight,
    RectTop, RectBottom, RectTopLeft, RectTopRight, RectBottomLeft, RectBottomRight,
    RectLeft, RectRight, RectWhole, RaggedLeft, RaggedRight
};
QImage DrawFramePiece(FrameLook look, FramePiece piece);

// Cursor and selection handles (sliders.cpp), all of one size.
enum class SliderKind { EditTop, EditBottom, Play, Selection, SelectionBegin, SelectionEnd };
QImage DrawSlider(SliderKind kind);

// The smart-zoom button's faces (buttons.cpp), one per zoom action.
enum class ZoomFace { Selection, In, Out, Full, VerticalIn, VerticalOut };
QImage DrawZoomButton(ZoomFace face);
QImage DrawMagnifierIcon(bool with_menu_arrow);

// Everything else (glyphs.cpp).
QImage DrawVolume(int waves); // 1 to 3 sound waves; -1 muted
QImage DrawPlayOverlay();
QImage DrawCancel();
QImage DrawMouse();
QImage DrawBackgroundTile();

} // namespace velm::pictures
