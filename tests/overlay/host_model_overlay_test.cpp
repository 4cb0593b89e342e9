// The model's overlay operations: the cases where no overlay is made, and
// deleting an overlay whichever side of a context binding goes first.
#include <memory>

#include "memory_context.h"
#include "model_host.h"

namespace {

using HostModelOverlayTest = ModelHostTest;

TEST_F(HostModelOverlayTest, NoOverlayWithoutFactoryOrObject) {
    ulkHostModel closed(0);
    EXPECT_EQ(closed.NewOverlay(), nullptr);  // no module to ask
    closed.DeleteOverlay(nullptr);

    ulkHostModel noFactory(0);
    ASSERT_TRUE(noFactory.Open(TestPluginPath("overlay_plugin_no_factory").c_str(), 0, nullptr));
    noFactory.SetPluginWarning("left by the host");
    EXPECT_EQ(noFactory.NewOverlay(), nullptr);
    EXPECT_EQ(noFactory.GetError(), kErrorPluginWarning);  // no status of its own

    ulkHostModel bare(2);  // the factory answers null for this model
    ASSERT_TRUE(bare.Open(TestPluginPath("overlay_plugin").c_str(), 0, nullptr));
    EXPECT_EQ(bare.NewOverlay(), nullptr);
    EXPECT_EQ(bare.GetError(), kErrorNone);
}

TEST_F(HostModelOverlayTest, DeleteWithTheContextBoundOrAlreadyGone) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(TestPluginPath("overlay_plugin").c_str(), 0, nullptr));
    auto context = std::make_unique<MemoryContext>(8, 8, 40);
    ulkHostOverlay* overlay = model.NewOverlay();
    ASSERT_NE(overlay, nullptr);
    context->SetOverlay(overlay);
    model.DeleteOverlay(overlay);  // the overlay goes first: the context is left unbound
    EXPECT_FALSE(context->HasOverlay());
    EXPECT_TRUE(context->IsGoodContext());

    overlay = model.NewOverlay();
    overlay->SetContext(context.get());
    context.reset();  // the context goes first: the overlay no longer reaches it
    EXPECT_EQ(overlay->GetOverlayBuffer(), nullptr);
    overlay->Draw(false);  // the plug-in finds no surface and draws nothing
    model.DeleteOverlay(overlay);
}

}  // namespace
