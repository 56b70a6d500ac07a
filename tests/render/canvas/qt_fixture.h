// A Qt canvas being drawn on, with the host's painter, for the Qt tests.
#ifndef VELM_TEST_QT_FIXTURE_H
#define VELM_TEST_QT_FIXTURE_H

#include "render/canvas/velmcanvas.h"

#include <QImage>
#include <QPainter>
#include <QPixmap>

#include <gtest/gtest.h>

namespace velm::test {

class QtCanvas : public ::testing::Test {
protected:
    static constexpr int kWidth = 160;
    static constexpr int kHeight = 100;

    void SetUp() override
    {
        canvas = VELMCANVAS_CreateCanvasQT(nullptr, kWidth, kHeight);
        ASSERT_NE(canvas, nullptr);
        ASSERT_EQ(VELMCANVAS_ResizeCanvas(canvas, kWidth, kHeight), 1);
        Begin();
    }

    void TearDown() override { VELMCANVAS_DestroyCanvas(canvas); }

    void Begin()
    {
        ASSERT_EQ(VELMCANVAS_BeginDraw(canvas, &painter), 1);
        ASSERT_EQ(VELMCANVAS_SelectTarget(canvas, VELMCANVASTARGET_OUTPUT), 1);
    }

    // What the host would show; drawing goes on afterwards on the output.
    QImage Output()
    {
        VELMCANVAS_EndDraw(canvas);
        QImage shown = static_cast<QPixmap *>(VELMCANVAS_GetOutputHandle(canvas))->toImage();
        Begin();
        return shown.convertToFormat(QImage::Format_ARGB32);
    }

    void Background(uint32_t color)
    {
        VELMCANVAS_SelectColor(canvas, color);
        VELMCANVAS_FillRect(canvas, 0, 0, kWidth, kHeight, 0);
    }

    QPainter painter;
    VELMCANVAS canvas = nullptr;
};

// 0x00BBGGRR as the QRgb Qt reports for an opaque pixel.
inline QRgb Opaque(uint32_t color)
{
    return qRgb(color & 0xFF, (color >> 8) & 0xFF, (color >> 16) & 0xFF);
}

} // namespace velm::test

#endif // VELM_TEST_QT_FIXTURE_H
