// The Qt back-end's operations table.
#include "render/canvas/qt/qtcanvas_internal.h"

namespace velm::canvas::qt {

void VELMcanvas_QT_Initialize(_VELMCANVASOPS *ops)
{
    *ops = _VELMCANVASOPS{
        .CreateCanvas = _CreateCanvas,
        .GetOutputHandle = _GetOutputHandle,
        .GetDrawObject = _GetDrawObject,
        .SetDrawObject = _SetDrawObject,
        .SelectTarget = _SelectTarget,
        .BeginDraw = _BeginDraw,
        .EndDraw = _EndDraw,
        .UseLowProfile = _UseLowProfile,
        .ResizeCanvas = _ResizeCanvas,
        .DestroyCanvas = _DestroyCanvas,
        .CopyCanvas = _CopyCanvas,
        .InitPath = _InitPath,
        .ClosePath = _ClosePath,
        .Clear = _Clear,
        .ProtectDrawArea = _ProtectDrawArea,
        .SetDrawArea = _SetDrawArea,
        .ClearDrawArea = _ClearDrawArea,
        .GetDimension = _GetDimension,
        .GetMaxDimension = _GetMaxDimension,
        .DrawPoint = _DrawPoint,
        .MoveTo = _MoveTo,
        .LineTo = _LineTo,
        .DrawPolygon = _DrawPolygon,
        .DrawPolyline = _DrawPolyline,
        .DrawLine = _DrawLine,
        .TextOut = _TextOut,
        .TextOutVertical = _TextOutVertical,
        .SaveOverlay = _SaveOverlay,
        .GetOverlayRect = _GetOverlayRect,
        .RestoreOverlay = _RestoreOverlay,
        .CreateImage = _CreateImage,
        .CopyImage = _CopyImage,
        .PasteImage = _PasteImage,
        .PasteImageScaled = _PasteImageScaled,
        .DestroyImage = _DestroyImage,
        .ImageWidth = _ImageWidth,
        .ImageHeight = _ImageHeight,
        .PutImage = _PutImage,
        .FillRect = _FillRect,
        .BorderRect = _BorderRect,
        .FillHorzGradientRect = _FillHorzGradientRect,
        .FillVertGradientRect = _FillVertGradientRect,
        .ShadowRect = _ShadowRect,
        .SelectColor = _SelectColor,
        .SelectColorMap = _SelectColorMap,
        .SelectShadowColor = _SelectShadowColor,
        .SelectFont = _SelectFont,
        .SelectFontColor = _SelectFontColor,
        .SelectGradient = _SelectGradient,
        .SetAlphaFactor = _SetAlphaFactor,
        .MoveBlock = _MoveBlock,
        .MoveBlock2 = _MoveBlock2,
        .TextWidth = _TextWidth,
        .TextHeight = _TextHeight,
        .DrawAlphaRect = _DrawAlphaRect,
        .DrawImage = _DrawImage,
        .LoadImage = _LoadImage,
    };
}

const _VELMCANVASOPS &Operations()
{
    // Filled once, under the language's guarded initialisation.
    static const _VELMCANVASOPS ops = [] {
        _VELMCANVASOPS table{};
        VELMcanvas_QT_Initialize(&table);
        return table;
    }();
    return ops;
}

} // namespace velm::canvas::qt
