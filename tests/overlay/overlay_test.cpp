// Plug-in overlays made by a real module: their modes, drawing into the
// context's memory, dragging the bound instance's point parameter, and the
// defaults of the plug-in overlay base.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>

#include "memory_context.h"
#include "registry_guard.h"
#include "test_paths.h"
#include "ulk/instance/host_instance.h"
#include "ulk/model/host_model.h"
#include "ulk/overlay/host_overlay.h"
#include "ulk/overlay/overlay.h"
#include "ulk/params/compound.h"

namespace {

class PluginOverlayTest : public ::testing::Test {
  protected:
    void SetUp() override {
        ulkHostModel::SetAllocCallback(std::malloc);
        ulkHostModel::SetFreeCallback(std::free);
    }
    void TearDown() override { ResetRegistry(); }

    std::string mPath = TestPluginPath("overlay_plugin");
};

std::string ModeName(ulkHostOverlay* overlay, int index) {
    char buffer[64] = {};
    overlay->GetModeName(index, buffer, sizeof buffer);
    return buffer;
}

}  // namespace

TEST_F(PluginOverlayTest, DefaultDefinitionGivesOneModeAndBaseAnswers) {
    ulkHostModel model(1);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);
    EXPECT_EQ(model.GetError(), kErrorNone);
    EXPECT_EQ(overlay->GetPlugInOverlay()->mHostOverlay, overlay);
    EXPECT_EQ(overlay->GetNumModes(), 1);
    EXPECT_EQ(ModeName(overlay, 0), "ULK Plug-in Overlay");
    EXPECT_EQ(overlay->GetMode(), 0);
    EXPECT_EQ(overlay->GetInstance(), nullptr);

    // What the plug-in overrides answers; the rest is the base's.
    EXPECT_TRUE(overlay->OnMouseDown(1, 1, 0));
    EXPECT_FALSE(overlay->OnMouseOver(1, 1, 0));
    EXPECT_FALSE(overlay->OnMouseIdle(1, 1, 0));
    EXPECT_FALSE(overlay->OnKeyDown('a', 0));
    EXPECT_FALSE(overlay->OnKeyUp('a', 0));
    overlay->SetMode(0);
    overlay->OnNewNativeWindow();
    EXPECT_EQ(overlay->GetError(), kErrorNone);

    // Without an OpenGL context of its own the context gives the plug-in none.
    MemoryContext context(4, 4, 16);
    overlay->SetContext(&context);
    ulkOverlay_v1* plugin = overlay->GetPlugInOverlay();
    EXPECT_EQ(plugin->GetOpenGLContext(), nullptr);
    EXPECT_EQ(plugin->GetNativeWindow(), &context.mWindowToken);
    EXPECT_EQ(plugin->GetOverlayBuffer(), overlay->GetOverlayBuffer());

    model.DeleteOverlay(overlay);
    EXPECT_FALSE(context.HasOverlay());
}

TEST_F(PluginOverlayTest, ForeignLinkIsStoredWithoutDefinition) {
    ulkHostModel model(1);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostOverlay* owner = model.NewOverlay();
    ASSERT_NE(owner, nullptr);
    ulkOverlay_v1* plugin = owner->GetPlugInOverlay();

    ulkHostOverlay other;
    other.SetPlugInOverlay(plugin);
    EXPECT_EQ(other.GetPlugInOverlay(), plugin);
    EXPECT_EQ(other.GetNumModes(), 0);  // the plug-in's link names another overlay
    EXPECT_TRUE(other.OnMouseUp(0, 0, 0));
    other.SetPlugInOverlay(nullptr);  // the owner deletes it, not this one

    model.DeleteOverlay(owner);
}

TEST_F(PluginOverlayTest, OwnModesAndModeNotifications) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);
    EXPECT_EQ(overlay->GetNumModes(), 2);
    EXPECT_EQ(ModeName(overlay, 0), "Move");
    EXPECT_EQ(ModeName(overlay, 1), "Frame");

    overlay->SetMode(1);
    EXPECT_STREQ(overlay->GetErrorString(), "mode 1, change 1");
    EXPECT_EQ(overlay->GetMode(), 1);
    overlay->SetMode(1);  // the current mode again still notifies
    EXPECT_EQ(overlay->GetError(), kErrorPluginWarning);
    EXPECT_STREQ(overlay->GetErrorString(), "mode 1, change 2");
    model.DeleteOverlay(overlay);
}

TEST_F(PluginOverlayTest, DrawsOutlineAndDragsThePoint) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(mPath.c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    ASSERT_NE(instance, nullptr);
    instance->SetVideoType(kVideoTypeProgressive);
    instance->SetTotalFrames(11);
    instance->SetCurrentFrame(5);  // time 0.5
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);

    // 20 x 14 pixels in rows of 96 bytes: 16 bytes of padding a row.
    MemoryContext context(20, 14, 96);
    context.mVidRect = {2, 3, 17, 12};
    std::memset(context.mPixels.data(), 0x5A, context.mPixels.size());
    context.SetOverlay(overlay);
    overlay->SetInstance(instance);
    EXPECT_EQ(overlay->GetInstance(), instance->GetPluginInstance());

    overlay->Draw(true);
    const uint8_t outline[4] = {0x20, 0x80, 0xF0, 0xFF};
    auto isOutline = [&](int x, int y) {
        for (int c = 0; c < 4; ++c)
            if (context.Sample(x, y, c) != outline[c]) return false;
        return true;
    };
    for (int y = 0; y < 14; ++y) {
        for (int x = 0; x < 20; ++x) {
            const bool onEdge = ((y == 3 || y == 12) && x >= 2 && x <= 17) ||
                                ((x == 2 || x == 17) && y >= 3 && y <= 12);
            if (onEdge) {
                EXPECT_TRUE(isOutline(x, y)) << x << "," << y;
            } else {
                for (int c = 0; c < 4; ++c)
                    EXPECT_EQ(context.Sample(x, y, c), 0x5A) << x << "," << y;
            }
        }
        // The padding after each row stays the host's.
        for (int b = 80; b < 96; ++b) EXPECT_EQ(context.mPixels[y * 96 + b], 0x5A) << y;
    }

    ulkParameter* parameter = instance->FindParameter("centre");
    ASSERT_NE(parameter, nullptr);
    ASSERT_TRUE(parameter->IsPoint2D());
    ulkPPoint2D* centre = static_cast<ulkPPoint2D*>(parameter);

    EXPECT_FALSE(overlay->OnMouseMove(5, 5, 0));  // no drag in progress
    EXPECT_TRUE(overlay->OnMouseDown(6, 5, 1));
    EXPECT_TRUE(overlay->OnMouseMove(10, 8, 1));
    EXPECT_TRUE(overlay->OnMouseUp(14, 11, 0));
    EXPECT_FALSE(overlay->OnMouseMove(3, 3, 0));  // the drag ended
    // The video rectangle is 16 x 10 pixels starting at (2, 3).
    EXPECT_TRUE(centre->IsKeyTime(0.5));
    ulkPoint2D at = centre->GetValue(0.5);
    EXPECT_DOUBLE_EQ(at.x, 12.0 / 16.0);
    EXPECT_DOUBLE_EQ(at.y, 8.0 / 10.0);

    // Without an instance the plug-in has nothing to drag.
    overlay->ReleaseInstance();
    EXPECT_EQ(overlay->GetInstance(), nullptr);
    EXPECT_FALSE(overlay->OnMouseDown(6, 5, 1));

    model.DeleteOverlay(overlay);
    EXPECT_FALSE(context.HasOverlay());
    model.DeleteInstance(instance);
}
