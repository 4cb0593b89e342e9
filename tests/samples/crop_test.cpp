// The crop sample: pixels outside the rectangle cleared, inside untouched,
// the sizes it reports, and its overlay drawing into a host surface and
// keying the rectangle as the mouse drags it.
#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <memory>

#include "sample_host.h"

namespace {

/// The part of the picture kept by a rectangle: pixels whose centre lies inside.
bool Kept(const ulkRect2D& r, int x, int y, int w, int h) {
    const double u = (x + 0.5) / w, v = (y + 0.5) / h;
    return u >= std::min(r.x1, r.x2) && u < std::max(r.x1, r.x2) && v >= std::min(r.y1, r.y2) &&
           v < std::max(r.y1, r.y2);
}

Rgba Pattern(int x, int y) {
    return {(x * 13 + 1) % 256, (y * 29 + 2) % 256, (x * y + 3) % 256, 100 + x};
}

Rgba Sides(const ulkBounds& b) {
    return {b.left, b.top, b.right, b.bottom};
}

using CropTest = SampleTest;

TEST_F(CropTest, ClearsOutsideAndKeepsInsideInEveryOrderAndDepth) {
    // Corners given in the other order mean the same rectangle.
    const ulkRect2D rects[] = {{0.1, 0.2, 0.6, 0.9}, {0.7, 0.8, 0.25, 0.3}};
    for (int bits : {8, 16}) {
        for (ulkImgFormat format : kSampleFormats) {
            SCOPED_TRACE(::testing::Message() << format << " " << bits);
            SampleEffect crop("crop");
            ASSERT_TRUE(crop.ok()) << crop.model().GetErrorString();
            HostImage in(format, 20, 10, bits, 5), out(format, 20, 10, bits, 11);
            in.Paint(Pattern);
            for (const ulkRect2D& r : rects) {
                out.Fill({1, 1, 1, 1});
                crop.Param<ulkPRect2D>("rect")->SetValue(0.0, r);
                ASSERT_TRUE(crop.Run(in, out)) << crop.instance()->GetErrorString();
                ExpectPixels(out, [&](int x, int y) {
                    return Kept(r, x, y, out.width(), out.height()) ? Pattern(x, y) : Rgba{};
                });
            }
        }
    }
}

TEST_F(CropTest, SizesFollowTheRectangleAndAFullOneLeavesTheCopyToTheHost) {
    SampleEffect crop("crop");
    ASSERT_TRUE(crop.ok());
    HostImage in(kImgFormatBGRA, 20, 10), out(kImgFormatBGRA, 20, 10);
    in.Paint(Pattern);
    ASSERT_TRUE(crop.Set("rect", "0.1,0.1,0.9,0.9"));
    ASSERT_TRUE(crop.Run(in, out));  // the instance now holds the rectangle
    EXPECT_TRUE(crop.instance()->HasEffect());

    // Pixel 2's centre, 2.5 / 20, is the first past 0.1.
    ulkBounds produced = {0, 0, 19, 9}, needed = {0, 5, 10, 9};
    crop.instance()->GetOutputSize(&produced);
    crop.instance()->GetInputSize(&needed);
    EXPECT_EQ(Sides(produced), (Rgba{2, 1, 17, 8}));
    EXPECT_EQ(Sides(needed), (Rgba{2, 5, 10, 8}));

    ASSERT_TRUE(crop.Set("rect", "0,0,1,1"));
    out.Fill({});
    ASSERT_TRUE(crop.Run(in, out));
    EXPECT_FALSE(crop.instance()->HasEffect());
    EXPECT_FALSE(crop.instance()->InPlace());  // the host copies into the output
    ExpectPixels(out, Pattern);
}

// A host's overlay surface: BGRA rows with padding, the video 100 x 80 pixels
// from (10, 10), so picture unit u lies at x 10 + 100 u and v at y 10 + 80 v.
class Surface : public ulkBaseOverlayContext {
  public:
    unsigned char* GetBuffer() override { return image.data(); }
    void* GetNativeWindow() override { return nullptr; }
    void GetVidRect(ulkBounds& rect) override { rect = {10, 10, 109, 89}; }
    short GetWidth() override { return 130; }
    short GetHeight() override { return 100; }
    short GetRowDelta() override { return 130 * 4 + 12; }
    bool Drawn(int x, int y) const {
        const Rgba p = image.Get(x, y);
        return p[3] == 255 && p[0] + p[1] + p[2] > 0;
    }

    HostImage image{kImgFormatBGRA, 130, 100, 8, 12};
};

void ExpectRect(const ulkRect2D& got, const ulkRect2D& want) {
    EXPECT_NEAR(got.x1, want.x1, 1e-9);
    EXPECT_NEAR(got.y1, want.y1, 1e-9);
    EXPECT_NEAR(got.x2, want.x2, 1e-9);
    EXPECT_NEAR(got.y2, want.y2, 1e-9);
}

TEST_F(CropTest, OverlayDrawsTheRectangleAndDragsKeyIt) {
    SampleEffect crop("crop");
    ASSERT_TRUE(crop.ok());
    auto remove = [&](ulkHostOverlay* overlay) { crop.model().DeleteOverlay(overlay); };
    std::unique_ptr<ulkHostOverlay, decltype(remove)> overlay(crop.model().NewOverlay(), remove);
    ASSERT_NE(overlay, nullptr) << crop.model().GetErrorString();
    Surface surface;
    overlay->SetContext(&surface);
    overlay->SetInstance(crop.instance());
    ulkPRect2D* rect = crop.Param<ulkPRect2D>("rect");
    rect->SetValue(0.0, {0.1, 0.1, 0.9, 0.9});

    // The outline on surface columns 20..99 and rows 18..81 and 7 x 7 handles on
    // its corners, opaque and coloured; nothing else.
    overlay->Draw(true);
    for (int y = 0; y < 100; ++y)
        for (int x = 0; x < 130; ++x) {
            const bool across = x >= 20 && x <= 99 && (y == 18 || y == 81);
            const bool down = y >= 18 && y <= 81 && (x == 20 || x == 99);
            const bool handle = (std::abs(x - 20) <= 3 || std::abs(x - 99) <= 3) &&
                                (std::abs(y - 18) <= 3 || std::abs(y - 81) <= 3);
            ASSERT_EQ(surface.Drawn(x, y), across || down || handle) << x << "," << y;
        }
    EXPECT_TRUE(surface.image.PaddingIntact());

    overlay->SetMode(1);                            // Resize
    EXPECT_FALSE(overlay->OnMouseDown(60, 50, 0));  // nowhere near a corner
    ASSERT_TRUE(overlay->OnMouseDown(21, 19, 0));   // on the top-left handle
    EXPECT_TRUE(overlay->OnMouseMove(30, 26, 0));
    EXPECT_TRUE(overlay->OnMouseUp(40, 34, 0));     // picture (0.3, 0.3)
    EXPECT_FALSE(overlay->OnMouseMove(50, 50, 0));  // the drag is over
    ASSERT_EQ(rect->GetNumKeys(), 1);
    ExpectRect(rect->GetValue(0.0), {0.3, 0.3, 0.9, 0.9});
    EXPECT_TRUE(crop.instance()->GetHostParametersModified());

    crop.SetFrame(4, 5);                           // time 1
    ASSERT_TRUE(overlay->OnMouseDown(99, 81, 0));  // bottom-right handle
    EXPECT_TRUE(overlay->OnMouseUp(200, 200, 0));  // beyond the video: clamped to it
    ASSERT_EQ(rect->GetNumKeys(), 2);
    ExpectRect(rect->GetValue(0.0), {0.3, 0.3, 0.9, 0.9});
    ExpectRect(rect->GetValue(1.0), {0.3, 0.3, 1.0, 1.0});

    // Move keeps the size and stops at the picture's edges.
    overlay->SetMode(0);
    EXPECT_FALSE(overlay->OnMouseDown(12, 12, 0));  // outside the rectangle
    ASSERT_TRUE(overlay->OnMouseDown(60, 50, 0));
    EXPECT_TRUE(overlay->OnMouseUp(55, 42, 0));  // -0.05, -0.1
    ExpectRect(rect->GetValue(1.0), {0.25, 0.2, 0.95, 0.9});
    ASSERT_TRUE(overlay->OnMouseDown(50, 50, 0));
    EXPECT_TRUE(overlay->OnMouseUp(0, 99, 0));  // far down-left
    ExpectRect(rect->GetValue(1.0), {0.0, 0.3, 0.7, 1.0});
}

}  // namespace
