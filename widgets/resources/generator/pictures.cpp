#include "widgets/resources/generator/pictures.h"

namespace velm::pictures {
namespace {

using enum FrameLook;
using enum FramePiece;

template <FrameLook look, FramePiece piece>
QImage Frame()
{
    return DrawFramePiece(look, piece);
}

template <SliderKind kind>
QImage Slider()
{
    return DrawSlider(kind);
}

template <ZoomFace face>
QImage Zoom()
{
    return DrawZoomButton(face);
}

template <int waves>
QImage Volume()
{
    return DrawVolume(waves);
}

const PictureSpec kPictures[] = {
    {"Background", DrawBackgroundTile},
    {"BottomCursorSlider", Slider<SliderKind::EditBottom>},
    {"Cancel", DrawCancel},
    {"LeftSelectionSlider", Slider<SliderKind::SelectionBegin>},
    {"Lupa", [] { return DrawMagnifierIcon(false); }},
    {"LupaMenu", [] { return DrawMagnifierIcon(true); }},
    {"Mouse", DrawMouse},
    {"PlayOverlay", DrawPlayOverlay},
    {"RedCursorSlider", Slider<SliderKind::Play>},
    {"RegionRaggedLeft", Frame<Plain, RaggedLeft>},
    {"RegionRaggedRight", Frame<Plain, RaggedRight>},
    {"RegionRectBottomLeft", Frame<Plain, RectBottomLeft>},
    {"RegionRectBottomOpen", Frame<Plain, RectBottom>},
    {"RegionRectBottomRight", Frame<Plain, RectBottomRight>},
    {"RegionRectLeft", Frame<Plain, RectLeft>},
    {"RegionRectOpen", Frame<Plain, RectWhole>},
    {"RegionRectRight", Frame<Plain, RectRight>},
    {"RegionRectTopLeft", Frame<Plain, RectTopLeft>},
    {"RegionRectTopOpen", Frame<Plain, RectTop>},
    {"RegionRectTopRight", Frame<Plain, RectTopRight>},
    {"RegionRoundBottomLeftOpen", Frame<Plain, RoundBottomLeft>},
    {"RegionRoundBottomRightOpen", Frame<Plain, RoundBottomRight>},
    {"RegionRoundLeftOpen", Frame<Plain, RoundLeft>},
    {"RegionRoundRightOpen", Frame<Plain, RoundRight>},
    {"RegionRoundTopLeftOpen", Frame<Plain, RoundTopLeft>},
    {"RegionRoundTopRightOpen", Frame<Plain, RoundTopRight>},
    {"RightSelectionSlider", Slider<SliderKind::SelectionEnd>},
    {"SelRegionRectBottomOpen", Frame<Selected, RectBottom>},
    {"SelRegionRectLeft", Frame<Selected, RectLeft>},
    {"SelRegionRectOpen", Frame<Selected, RectWhole>},
    {"SelRegionRectRight", Frame<Selected, RectRight>},
    {"SelRegionRectTopOpen", Frame<Selected, RectTop>},
    {"SelRegionRoundBottomLeftOpen", Frame<Selected, RoundBottomLeft>},
    {"SelRegionRoundBottomRightOpen", Frame<Selected, RoundBottomRight>},
    {"SelRegionRoundLeftOpen", Frame<Selected, RoundLeft>},
    {"SelRegionRoundRightOpen", Frame<Selected, RoundRight>},
    {"SelRegionRoundTopLeftOpen", Frame<Selected, RoundTopLeft>},
    {"SelRegionRoundTopRightOpen", Frame<Selected, RoundTopRight>},
    {"TopCursorSlider", Slider<SliderKind::EditTop>},
    {"TransparentCursorSlider", Slider<SliderKind::Selection>},
    {"Volume33", Volume<1>},
    {"Volume66", Volume<2>},
    {"VolumeOff", Volume<-1>},
    {"VolumeOn", Volume<3>},
    {"ZoomFull", Zoom<ZoomFace::Full>},
    {"ZoomIn", Zoom<ZoomFace::In>},
    {"ZoomOut", Zoom<ZoomFace::Out>},
    {"ZoomSelection", Zoom<ZoomFace::Selection>},
    {"ZoomVertIn", Zoom<ZoomFace::VerticalIn>},
    {"ZoomVertOut", Zoom<ZoomFace::VerticalOut>},
};

} // namespace

std::span<const PictureSpec> AllPictures()
{
    return kPictures;
}

} // namespace velm::pictures
