// The model's overlay operations: the cases where no overlay is made, and
// deleting an overlay whichever side of a context binding goes first.
#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>
#include <string>

#include "memory_context.h"
#include "registry_guard.h"
#include "test_paths.h"
#include "ulk/model/host_model.h"
#include "ulk/overlay/host_overlay.h"

namespace {

class HostModelOverlayTest : public ::testing::Test {
  protected:
    void SetUp() override {
        ulkHostModel::SetAllocCallback(std::malloc);
        ulkHostModel::SetFreeCallback(std::free);
    }
    void TearDown() override { ResetRegistry(); }
};

}  // namespace

TEST_F(HostModelOverlayTest, NoOverlayWithoutFactoryOrObject) {
    ulkHostModel closed(0);
    EXPECT_EQ(closed.NewOverlay(), nullptr);  // no module to ask
    closed.DeleteOverlay(nullptr);

    ulkHostModel noFactory(0);
    ASSERT_TRUE(noFactory.Open(TestPluginPath("overlay_plugin_no_factory").c_str(), 0, nullptr));
    noFactory.SetPluginWarning("left by the host");
    EXPECT_EQ(noFactory.NewOverlay(), nullptr);
    EXPECT_EQ(noFactory.GetError(), kErrorPluginWarning);  // no status of its own
    noFactory.Close();

    ulkHostModel bare(2);  // the factory answers null for this model
    ASSERT_TRUE(bare.Open(TestPluginPath("overlay_plugin").c_str(), 0, nullptr));
    EXPECT_EQ(bare.NewOverlay(), nullptr);
    EXPECT_EQ(bare.GetError(), kErrorNone);
}

TEST_F(HostModelOverlayTest, DeleteWithTheContextBoundOrAlreadyGone) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(TestPluginPath("overlay_plugin").c_str(), 0, nullptr));

    // The overlay goes first: the context is left unbound and usable.
    auto context = std::make_unique<MemoryContext>(8, 8, 40);
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);
    context->SetOverlay(overlay);
    overlay->Draw(false);
    model.DeleteOverlay(overlay);
    EXPECT_FALSE(context->HasOverlay());
    EXPECT_TRUE(context->IsGoodContext());

    // The context goes first: the overlay no longer reaches it.
    ulkHostOverlay* second = model.NewOverlay();
    ASSERT_NE(second, nullptr);
    second->SetContext(context.get());
    EXPECT_TRUE(context->HasOverlay());
    context.reset();
    EXPECT_EQ(second->GetContext(), nullptr);
    EXPECT_EQ(second->GetOverlayBuffer(), nullptr);
    second->Draw(false);  // the plug-in finds no surface and draws nothing
    EXPECT_TRUE(second->IsGoodOverlay());
    model.DeleteOverlay(second);
}
