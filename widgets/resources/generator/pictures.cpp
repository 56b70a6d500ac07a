#include "widgets/resources/generator/pictures.h"

namespace velm::pictures {
namespace {

using enum FrameLook;
using enum FramePiece;

// A picture drawn by one of the parameterised painters.
template <auto draw, auto... arguments>
QImage With()
{
    return draw(arguments...);
}

const PictureSpec kPictures[] = {
    {"Background", DrawBackgroundTile},
    {"BottomCursorSlider", With<DrawSlider, SliderKind::EditBottom>},
    {"Cancel", DrawCancel},
    {"LeftSelectionSlider", With<DrawSlider, SliderKind::SelectionBegin>},
    {"Lupa", With<DrawMagnifierIcon, false>},
    {"LupaMenu", With<DrawMagnifierIcon, true>},
    {"Mouse", DrawMouse},
    {"PlayOverlay", DrawPlayOverlay},
    {"RedCursorSlider", With<DrawSlider, SliderKind::Play>},
    {"RegionRaggedLeft", With<DrawFramePiece, Plain, RaggedLeft>},
    {"RegionRaggedRight", With<DrawFramePiece, Plain, RaggedRight>},
    {"RegionRectBottomLeft", With<DrawFramePiece, Plain, RectBottomLeft>},
    {"RegionRectBottomOpen", With<DrawFramePiece, Plain, RectBottom>},
    {"RegionRectBottomRight", With<DrawFramePiece, Plain, RectBottomRight>},
    {"RegionRectLeft", With<DrawFramePiece, Plain, RectLeft>},
    {"RegionRectOpen", With<DrawFramePiece, Plain, RectWhole>},
    {"RegionRectRight", With<DrawFramePiece, Plain, RectRight>},
    {"RegionRectTopLeft", With<DrawFramePiece, Plain, RectTopLeft>},
    {"RegionRectTopOpen", With<DrawFramePiece, Plain, RectTop>},
    {"RegionRectTopRight", With<DrawFramePiece, Plain, RectTopRight>},
    {"RegionRoundBottomLeftOpen", With<DrawFramePiece, Plain, RoundBottomLeft>},
    {"RegionRoundBottomRightOpen", With<DrawFramePiece, Plain, RoundBottomRight>},
    {"RegionRoundLeftOpen", With<DrawFramePiece, Plain, RoundLeft>},
    {"RegionRoundRightOpen", With<DrawFramePiece, Plain, RoundRight>},
    {"RegionRoundTopLeftOpen", With<DrawFramePiece, Plain, RoundTopLeft>},
    {"RegionRoundTopRightOpen", With<DrawFramePiece, Plain, RoundTopRight>},
    {"RightSelectionSlider", With<DrawSlider, SliderKind::SelectionEnd>},
    {"SelRegionRectBottomOpen", With<DrawFramePiece, Selected, RectBottom>},
    {"SelRegionRectLeft", With<DrawFramePiece, Selected, RectLeft>},
    {"SelRegionRectOpen", With<DrawFramePiece, Selected, RectWhole>},
    {"SelRegionRectRight", With<DrawFramePiece, Selected, RectRight>},
    {"SelRegionRectTopOpen", With<DrawFramePiece, Selected, RectTop>},
    {"SelRegionRoundBottomLeftOpen", With<DrawFramePiece, Selected, RoundBottomLeft>},
    {"SelRegionRoundBottomRightOpen", With<DrawFramePiece, Selected, RoundBottomRight>},
    {"SelRegionRoundLeftOpen", With<DrawFramePiece, Selected, RoundLeft>},
    {"SelRegionRoundRightOpen", With<DrawFramePiece, Selected, RoundRight>},
    {"SelRegionRoundTopLeftOpen", With<DrawFramePiece, Selected, RoundTopLeft>},
    {"SelRegionRoundTopRightOpen", With<DrawFramePiece, Selected, RoundTopRight>},
    {"TopCursorSlider", With<DrawSlider, SliderKind::EditTop>},
    {"TransparentCursorSlider", With<DrawSlider, SliderKind::Selection>},
    {"Volume33", With<DrawVolume, 1>},
    {"Volume66", With<DrawVolume, 2>},
    {"VolumeOff", With<DrawVolume, -1>},
    {"VolumeOn", With<DrawVolume, 3>},
    {"ZoomFull", With<DrawZoomButton, ZoomFace::Full>},
    {"ZoomIn", With<DrawZoomButton, ZoomFace::In>},
    {"ZoomOut", With<DrawZoomButton, ZoomFace::Out>},
    {"ZoomSelection", With<DrawZoomButton, ZoomFace::Selection>},
    {"ZoomVertIn", With<DrawZoomButton, ZoomFace::VerticalIn>},
    {"ZoomVertOut", With<DrawZoomButton, ZoomFace::VerticalOut>},
};

} // namespace

std::span<const PictureSpec> AllPictures()
{
    return kPictures;
}

} // namespace velm::pictures
