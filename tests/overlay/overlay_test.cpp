// Plug-in overlays made by a real module: their modes, drawing into the
// context's memory, dragging the bound instance's point parameter, and the
// defaults of the plug-in overlay base.
#include <cstring>
#include <string>

#include "memory_context.h"
#include "model_host.h"

namespace {

class PluginOverlayTest : public ModelHostTest {
  protected:
    std::string mPath = TestPluginPath("overlay_plugin");
};

std::string ModeName(ulkHostOverlay* overlay, int index) {
    char buffer[64] = {};
    overlay->GetModeName(index, buffer, sizeof buffer);
    return buffer;
}

TEST_F(PluginOverlayTest, DefaultDefinitionGivesOneModeAndBaseAnswers) {
    ulkHostModel model(1);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);
    EXPECT_EQ(overlay->GetPlugInOverlay()->mHostOverlay, overlay);
    EXPECT_EQ(overlay->GetNumModes(), 1);
    EXPECT_EQ(ModeName(overlay, 0), "ULK Plug-in Overlay");
    // What the plug-in overrides answers; the rest is the base's.
    EXPECT_TRUE(overlay->OnMouseDown(1, 1, 0));
    EXPECT_FALSE(overlay->OnMouseOver(1, 1, 0));
    EXPECT_FALSE(overlay->OnKeyDown('a', 0));
    // Without an OpenGL context of its own the context gives the plug-in none.
    MemoryContext context(4, 4, 16);
    overlay->SetContext(&context);
    EXPECT_EQ(overlay->GetPlugInOverlay()->GetOpenGLContext(), nullptr);

    // Another host overlay given this plug-in overlay is not the one it names: no definition.
    ulkHostOverlay other;
    other.SetPlugInOverlay(overlay->GetPlugInOverlay());
    EXPECT_EQ(other.GetNumModes(), 0);
    other.SetPlugInOverlay(nullptr);  // the owner deletes it, not this one
    model.DeleteOverlay(overlay);
    EXPECT_FALSE(context.HasOverlay());
}

TEST_F(PluginOverlayTest, OwnModesAndModeNotifications) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);
    EXPECT_EQ(overlay->GetNumModes(), 2);
    EXPECT_EQ(ModeName(overlay, 1), "Frame");
    overlay->SetMode(1);
    overlay->SetMode(1);  // the current mode again still notifies
    EXPECT_EQ(overlay->GetError(), kErrorPluginWarning);
    EXPECT_STREQ(overlay->GetErrorString(), "mode 1, change 2");
    EXPECT_EQ(overlay->GetMode(), 1);
    model.DeleteOverlay(overlay);
}

TEST_F(PluginOverlayTest, DrawsOutlineAndDragsThePoint) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    ASSERT_NE(instance, nullptr);
    instance->SetTotalFrames(11);
    instance->SetCurrentFrame(5);  // time 0.5
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);

    // 20 x 14 pixels in rows of 96 bytes: 16 bytes of padding a row.
    MemoryContext context(20, 14, 96);
    std::memset(context.mPixels.data(), 0x5A, context.mPixels.size());
    context.SetOverlay(overlay);
    overlay->SetInstance(instance);
    EXPECT_EQ(overlay->GetInstance(), instance->GetPluginInstance());

    overlay->Draw(true);
    const uint8_t outline[4] = {0x20, 0x80, 0xF0, 0xFF};
    for (int y = 0; y < 14; ++y)
        for (int b = 0; b < 96; ++b) {  // the video rectangle (2, 3)-(17, 12) is outlined
            const int x = b / 4;
            const bool onEdge = x < 20 && (((y == 3 || y == 12) && x >= 2 && x <= 17) ||
                                           ((x == 2 || x == 17) && y >= 3 && y <= 12));
            ASSERT_EQ(context.mPixels[y * 96 + b], onEdge ? outline[b % 4] : 0x5A)
                << x << "," << y;  // the padding after each row stays the host's
        }

    auto* centre = static_cast<ulkPPoint2D*>(instance->FindParameter("centre"));
    ASSERT_NE(centre, nullptr);
    EXPECT_FALSE(overlay->OnMouseMove(5, 5, 0));  // no drag in progress
    EXPECT_TRUE(overlay->OnMouseDown(6, 5, 1));
    EXPECT_TRUE(overlay->OnMouseMove(10, 8, 1));
    EXPECT_TRUE(overlay->OnMouseUp(14, 11, 0));
    EXPECT_FALSE(overlay->OnMouseMove(3, 3, 0));  // the drag ended
    // The video rectangle is 16 x 10 pixels starting at (2, 3).
    EXPECT_TRUE(centre->IsKeyTime(0.5));
    EXPECT_DOUBLE_EQ(centre->GetValue(0.5).x, 12.0 / 16.0);
    EXPECT_DOUBLE_EQ(centre->GetValue(0.5).y, 8.0 / 10.0);

    overlay->ReleaseInstance();  // without an instance the plug-in has nothing to drag
    EXPECT_FALSE(overlay->OnMouseDown(6, 5, 1));
    model.DeleteOverlay(overlay);
    model.DeleteInstance(instance);
}

}  // namespace
