// The crop sample: pixels outside the rectangle cleared, inside untouched,
// the sizes it reports, and its overlay drawing into a host surface and
// keying the rectangle as the mouse drags it.
#include <algorithm>
#include <cmath>
#include <vector>

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

class CropTest : public SampleTest {
  protected:
    static void FillPattern(HostImage& image) {
        for (int y = 0; y < image.height(); ++y)
            for (int x = 0; x < image.width(); ++x) image.Put(x, y, Pattern(x, y));
    }
    static void ExpectCropped(const HostImage& out, const ulkRect2D& r) {
        for (int y = 0; y < out.height(); ++y)
            for (int x = 0; x < out.width(); ++x)
                ASSERT_EQ(out.Get(x, y),
                          Kept(r, x, y, out.width(), out.height()) ? Pattern(x, y) : Rgba{})
                    << x << "," << y;
        EXPECT_TRUE(out.PaddingIntact());
    }
};

TEST_F(CropTest, ClearsOutsideAndKeepsInsideInEveryOrder) {
    for (ulkImgFormat format : kSampleFormats) {
        SCOPED_TRACE(format);
        SampleEffect crop("crop");
        ASSERT_TRUE(crop.ok()) << crop.model().GetErrorString();
        HostImage in(format, 20, 10, 8, 5), out(format, 20, 10, 8, 11);
        FillPattern(in);
        out.Fill({1, 1, 1, 1});
        ASSERT_TRUE(crop.Run(in, out)) << crop.instance()->GetErrorString();
        ExpectCropped(out, crop.Param<ulkPRect2D>("rect")->GetDefaultValue());

        // Corners given in the other order mean the same rectangle.
        const ulkRect2D reversed = {0.7, 0.8, 0.25, 0.3};
        crop.Param<ulkPRect2D>("rect")->SetValue(0.0, reversed);
        ASSERT_TRUE(crop.Run(in, out));
        ExpectCropped(out, reversed);
    }
}

TEST_F(CropTest, DefaultRectangleCropsAndAFullOneLeavesTheCopyToTheHost) {
    SampleEffect crop("crop");
    ASSERT_TRUE(crop.ok());
    EXPECT_STREQ(crop.model().GetIdentifier(), "com.ulk.samples.crop");
    const ulkRect2D standard = crop.Param<ulkPRect2D>("rect")->GetDefaultValue();
    EXPECT_GT(standard.x1, 0.0);  // a new crop does something visible
    EXPECT_LT(standard.x2, 1.0);

    HostImage in(kImgFormatRGBA, 12, 8, 16, 6), out(kImgFormatRGBA, 12, 8, 16, 6);
    FillPattern(in);
    crop.Param<ulkPRect2D>("rect")->SetValue(0.0, {0.0, 0.0, 1.0, 1.0});
    ASSERT_TRUE(crop.Run(in, out)) << crop.instance()->GetErrorString();
    EXPECT_FALSE(crop.instance()->HasEffect());
    EXPECT_FALSE(crop.instance()->InPlace());
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 12; ++x) ASSERT_EQ(out.Get(x, y), Pattern(x, y));

    // Sixteen-bit samples crop the same way.
    const ulkRect2D half = {0.5, 0.0, 1.0, 0.5};
    crop.Param<ulkPRect2D>("rect")->SetValue(0.0, half);
    ASSERT_TRUE(crop.Run(in, out));
    EXPECT_EQ(out.Get(5, 3), Rgba{});
    EXPECT_EQ(out.Get(6, 3), Pattern(6, 3));
    EXPECT_EQ(out.Get(6, 4), Rgba{});
}

TEST_F(CropTest, ReportsTheKeptRectangleAsItsInputAndOutputSize) {
    SampleEffect crop("crop");
    ASSERT_TRUE(crop.ok());
    HostImage in(kImgFormatBGRA, 20, 10), out(kImgFormatBGRA, 20, 10);
    crop.Param<ulkPRect2D>("rect")->SetValue(0.0, {0.1, 0.1, 0.9, 0.9});
    ASSERT_TRUE(crop.Run(in, out));  // the instance now holds the rectangle

    ulkBounds produced = {0, 0, 19, 9};
    crop.instance()->GetOutputSize(&produced);
    EXPECT_EQ(produced.left, 2);  // pixel 2's centre, 2.5 / 20, is the first past 0.1
    EXPECT_EQ(produced.top, 1);
    EXPECT_EQ(produced.right, 17);
    EXPECT_EQ(produced.bottom, 8);

    ulkBounds needed = {0, 5, 10, 9};
    crop.instance()->GetInputSize(&needed);
    EXPECT_EQ(needed.left, 2);
    EXPECT_EQ(needed.top, 5);
    EXPECT_EQ(needed.right, 10);
    EXPECT_EQ(needed.bottom, 8);
}

// ---------------------------------------------------------------- overlay

/// A host's drawing surface: BGRA rows with padding, the video inside a margin.
class Surface : public ulkBaseOverlayContext {
  public:
    Surface(short width, short height, short rowDelta, ulkBounds video)
        : mWidth(width),
          mHeight(height),
          mRowDelta(rowDelta),
          mVideo(video),
          mPixels(static_cast<size_t>(rowDelta) * height, 0) {}

    unsigned char* GetBuffer() override { return mPixels.data(); }
    void* GetNativeWindow() override { return nullptr; }
    void GetVidRect(ulkBounds& rect) override { rect = mVideo; }
    short GetWidth() override { return mWidth; }
    short GetHeight() override { return mHeight; }
    short GetRowDelta() override { return mRowDelta; }

    /// True when anything was drawn at (x, y).
    bool Drawn(int x, int y) const {
        const unsigned char* p = &mPixels[static_cast<size_t>(y) * mRowDelta + x * 4];
        return p[3] == 255 && (p[0] | p[1] | p[2]) != 0;
    }
    int CountDrawn() const {
        int count = 0;
        for (int y = 0; y < mHeight; ++y)
            for (int x = 0; x < mWidth; ++x) count += Drawn(x, y);
        return count;
    }
    bool PaddingClear() const {
        for (int y = 0; y < mHeight; ++y)
            for (int i = mWidth * 4; i < mRowDelta; ++i)
                if (mPixels[static_cast<size_t>(y) * mRowDelta + i] != 0) return false;
        return true;
    }

  private:
    short mWidth, mHeight, mRowDelta;
    ulkBounds mVideo;
    std::vector<unsigned char> mPixels;
};

class CropOverlayTest : public CropTest {
  protected:
    void SetUp() override {
        CropTest::SetUp();
        mCrop.reset(new SampleEffect("crop"));
        ASSERT_TRUE(mCrop->ok());
        mOverlay = mCrop->model().NewOverlay();
        ASSERT_NE(mOverlay, nullptr) << mCrop->model().GetErrorString();
        mOverlay->SetContext(&mSurface);
        mOverlay->SetInstance(mCrop->instance());
        mRect = mCrop->Param<ulkPRect2D>("rect");
        mRect->SetValue(0.0, {0.1, 0.1, 0.9, 0.9});
    }
    void TearDown() override {
        if (mOverlay) mCrop->model().DeleteOverlay(mOverlay);
        mCrop.reset();
        CropTest::TearDown();
    }

    // The video occupies 100 x 80 surface pixels from (10, 10): picture unit
    // u lies at surface x 10 + 100 u, v at surface y 10 + 80 v.
    Surface mSurface{130, 100, 130 * 4 + 12, ulkBounds{10, 10, 109, 89}};
    std::unique_ptr<SampleEffect> mCrop;
    ulkHostOverlay* mOverlay = nullptr;
    ulkPRect2D* mRect = nullptr;
};

TEST_F(CropOverlayTest, DrawsTheOutlineAndCornerHandlesOnTheVideo) {
    mOverlay->Draw(true);
    // Rectangle 0.1..0.9: surface columns 20..99 and rows 18..81.
    for (int x = 20; x <= 99; ++x) {
        EXPECT_TRUE(mSurface.Drawn(x, 18)) << x;
        EXPECT_TRUE(mSurface.Drawn(x, 81)) << x;
    }
    for (int y = 18; y <= 81; ++y) {
        EXPECT_TRUE(mSurface.Drawn(20, y)) << y;
        EXPECT_TRUE(mSurface.Drawn(99, y)) << y;
    }
    EXPECT_TRUE(mSurface.Drawn(17, 15));   // handle around the top-left corner
    EXPECT_TRUE(mSurface.Drawn(102, 84));  // ... and the bottom-right one
    EXPECT_FALSE(mSurface.Drawn(60, 50));  // the picture inside stays visible
    EXPECT_FALSE(mSurface.Drawn(16, 50));
    EXPECT_FALSE(mSurface.Drawn(60, 90));
    // Two sides of 80 and two of 64 pixels (corners shared), plus four 7 x 7 handles
    // less the 7 pixels each shares with the outline.
    EXPECT_EQ(mSurface.CountDrawn(), 2 * 80 + 2 * 62 + 4 * (49 - 7));
    EXPECT_TRUE(mSurface.PaddingClear());
}

TEST_F(CropOverlayTest, ResizeDragsTheNearestCornerAndKeysIt) {
    char name[16];
    mOverlay->GetModeName(1, name, sizeof name);
    EXPECT_STREQ(name, "Resize");
    mOverlay->SetMode(1);
    EXPECT_FALSE(mOverlay->OnMouseDown(60, 50, 0));  // nowhere near a corner
    ASSERT_TRUE(mOverlay->OnMouseDown(21, 19, 0));   // on the top-left handle
    EXPECT_TRUE(mOverlay->OnMouseMove(30, 26, 0));
    EXPECT_TRUE(mOverlay->OnMouseUp(40, 34, 0));     // picture (0.3, 0.3)
    EXPECT_FALSE(mOverlay->OnMouseMove(50, 50, 0));  // the drag is over

    ASSERT_EQ(mRect->GetNumKeys(), 1);
    const ulkRect2D r = mRect->GetValue(0.0);
    EXPECT_NEAR(r.x1, 0.3, 1e-9);
    EXPECT_NEAR(r.y1, 0.3, 1e-9);
    EXPECT_EQ(r.x2, 0.9);
    EXPECT_EQ(r.y2, 0.9);
    EXPECT_TRUE(mCrop->instance()->GetHostParametersModified());

    // The next frame renders with the dragged rectangle.
    HostImage in(kImgFormatRGBA, 20, 10, 8, 4), out(kImgFormatRGBA, 20, 10);
    FillPattern(in);
    ASSERT_TRUE(mCrop->Run(in, out));
    ExpectCropped(out, r);
}

TEST_F(CropOverlayTest, ResizeAtAnotherFrameAddsAKeyThere) {
    mCrop->SetFrame(4, 5);  // time 1
    mOverlay->SetMode(1);
    ASSERT_TRUE(mOverlay->OnMouseDown(99, 81, 0));  // bottom-right handle
    EXPECT_TRUE(mOverlay->OnMouseUp(200, 200, 0));  // beyond the video: clamped to it
    ASSERT_EQ(mRect->GetNumKeys(), 2);
    EXPECT_EQ(mRect->GetValue(0.0).x2, 0.9);
    EXPECT_EQ(mRect->GetValue(1.0).x2, 1.0);
    EXPECT_EQ(mRect->GetValue(1.0).y2, 1.0);
    EXPECT_NEAR(mRect->GetValue(0.5).x2, 0.95, 1e-9);  // interpolated between the keys
}

TEST_F(CropOverlayTest, MoveKeepsTheSizeAndStopsAtTheEdges) {
    mOverlay->SetMode(0);
    EXPECT_FALSE(mOverlay->OnMouseDown(12, 12, 0));  // outside the rectangle
    ASSERT_TRUE(mOverlay->OnMouseDown(50, 50, 0));
    EXPECT_TRUE(mOverlay->OnMouseUp(55, 42, 0));  // +0.05, -0.1
    ulkRect2D r = mRect->GetValue(0.0);
    EXPECT_NEAR(r.x1, 0.15, 1e-9);
    EXPECT_NEAR(r.x2, 0.95, 1e-9);
    EXPECT_NEAR(r.y1, 0.0, 1e-9);
    EXPECT_NEAR(r.y2, 0.8, 1e-9);

    ASSERT_TRUE(mOverlay->OnMouseDown(50, 50, 0));
    EXPECT_TRUE(mOverlay->OnMouseUp(0, 99, 0));  // far down-left: stops at the edges
    r = mRect->GetValue(0.0);
    EXPECT_NEAR(r.x1, 0.0, 1e-9);
    EXPECT_NEAR(r.x2, 0.8, 1e-9);
    EXPECT_NEAR(r.y1, 0.2, 1e-9);
    EXPECT_NEAR(r.y2, 1.0, 1e-9);

    // Drawn where it now is.
    mOverlay->Draw(true);
    EXPECT_TRUE(mSurface.Drawn(10, 50));
    EXPECT_FALSE(mSurface.Drawn(99, 50));
}

}  // namespace
