// The binding protocol between drawing contexts and host overlays, either side
// destroyed first, the liveness markers and copies of a context.
#include <gtest/gtest.h>

#include <memory>
#include <new>

#include "memory_context.h"
#include "ulk/overlay/host_overlay.h"

namespace {

bool Bound(MemoryContext& context, ulkHostOverlay& overlay) {
    return context.GetOverlay() == &overlay && overlay.GetContext() == &context;
}

TEST(OverlayContext, BindingFromEitherSideAndItsEdgeCases) {
    MemoryContext first(8, 8, 32), second(8, 8, 32);
    ulkHostOverlay a, b;
    first.ReleaseOverlay();  // unbound: nothing to do
    first.SetOverlay(&a);
    first.SetOverlay(&a);  // the same overlay again changes nothing
    EXPECT_TRUE(Bound(first, a));
    a.ReleaseContext();  // the overlay's side ends both ends
    EXPECT_FALSE(first.HasOverlay());
    EXPECT_EQ(a.GetContext(), nullptr);
    a.SetContext(&first);  // and binds from its side
    EXPECT_TRUE(Bound(first, a));

    first.SetOverlay(&b);  // a context releases its overlay in favour of a new one
    EXPECT_TRUE(Bound(first, b));
    EXPECT_EQ(a.GetContext(), nullptr);
    b.SetContext(&second);  // an overlay keeps its first context
    EXPECT_TRUE(Bound(first, b));
    EXPECT_FALSE(second.HasOverlay());
    second.SetOverlay(&a);
    second.SetOverlay(&b);  // a context refuses an overlay bound elsewhere and keeps its own
    EXPECT_TRUE(Bound(first, b));
    EXPECT_TRUE(Bound(second, a));

    b.ReleaseContext();
    b.SetContext(&second);  // an overlay takes over a context held by another
    EXPECT_TRUE(Bound(second, b));
    EXPECT_EQ(a.GetContext(), nullptr);
    second.SetOverlay(nullptr);  // null releases and binds nothing
    EXPECT_FALSE(second.HasOverlay());
    EXPECT_EQ(b.GetContext(), nullptr);
}

TEST(OverlayContext, EitherSideMayBeDestroyedFirst) {
    auto context = std::make_unique<MemoryContext>(8, 8, 32);
    auto overlay = std::make_unique<ulkHostOverlay>();
    context->SetOverlay(overlay.get());
    context.reset();
    EXPECT_EQ(overlay->GetContext(), nullptr);
    EXPECT_EQ(overlay->GetOverlayBuffer(), nullptr);
    EXPECT_EQ(overlay->GetNativeWindow(), nullptr);

    context = std::make_unique<MemoryContext>(8, 8, 32);
    overlay->SetContext(context.get());
    overlay.reset();
    EXPECT_FALSE(context->HasOverlay());
    ulkHostOverlay next;  // binds again without touching the destroyed overlay
    context->SetOverlay(&next);
    EXPECT_TRUE(Bound(*context, next));
    context->ReleaseOverlay();
}

TEST(OverlayContext, LivenessMarkersSurviveDestruction) {
    alignas(MemoryContext) unsigned char contextStorage[sizeof(MemoryContext)];
    alignas(ulkHostOverlay) unsigned char overlayStorage[sizeof(ulkHostOverlay)];
    MemoryContext* context = new (contextStorage) MemoryContext(4, 4, 16);
    ulkHostOverlay* overlay = new (overlayStorage) ulkHostOverlay;
    EXPECT_TRUE(context->IsGoodContext());
    EXPECT_TRUE(overlay->IsGoodOverlay());
    overlay->SetContext(context);
    overlay->~ulkHostOverlay();
    context->~MemoryContext();
    // What a host reads through a pointer it kept: the storage still holds the markers.
    const auto* deadContext = reinterpret_cast<ulkBaseOverlayContext*>(contextStorage);
    EXPECT_EQ(deadContext->mMagic, 0xFFFFFFFFDEADDEADULL);
    EXPECT_EQ(reinterpret_cast<ulkHostOverlay*>(overlayStorage)->mMagic, 0xFFFFFFFFDEADDEADULL);
    EXPECT_EQ(deadContext->mOverlay, nullptr);
}

TEST(OverlayContext, CopiesStartUnboundAndAssignmentKeepsBinding) {
    MemoryContext bound(8, 8, 32), other(8, 8, 32);
    ulkHostOverlay a, b;
    bound.SetOverlay(&a);
    other.SetOverlay(&b);
    MemoryContext copy(bound);
    EXPECT_FALSE(copy.HasOverlay());
    EXPECT_TRUE(copy.IsGoodContext());
    other = bound;  // the surface is copied, the binding is not
    EXPECT_TRUE(Bound(other, b));
    EXPECT_TRUE(Bound(bound, a));
    copy = bound;
    EXPECT_FALSE(copy.HasOverlay());
}

}  // namespace
