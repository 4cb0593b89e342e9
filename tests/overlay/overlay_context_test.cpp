// The binding protocol between drawing contexts and host overlays, and the
// destruction of either side first.
#include <gtest/gtest.h>

#include <memory>
#include <new>

#include "memory_context.h"
#include "ulk/overlay/host_overlay.h"

namespace {

bool Bound(MemoryContext& context, ulkHostOverlay& overlay) {
    return context.GetOverlay() == &overlay && overlay.GetContext() == &context;
}

}  // namespace

TEST(OverlayContext, EitherSideBindsAndReleases) {
    MemoryContext context(8, 8, 32);
    ulkHostOverlay a;
    EXPECT_FALSE(context.HasOverlay());
    EXPECT_EQ(context.GetOverlay(), nullptr);

    context.ReleaseOverlay();  // unbound: nothing to do
    EXPECT_FALSE(context.HasOverlay());

    context.SetOverlay(&a);
    EXPECT_TRUE(context.HasOverlay());
    EXPECT_TRUE(Bound(context, a));
    context.SetOverlay(&a);  // the same overlay again changes nothing
    EXPECT_TRUE(Bound(context, a));

    a.ReleaseContext();  // the overlay's side ends both ends
    EXPECT_FALSE(context.HasOverlay());
    EXPECT_EQ(a.GetContext(), nullptr);

    a.SetContext(&context);  // and binds from its side
    EXPECT_TRUE(Bound(context, a));
    context.ReleaseOverlay();
    EXPECT_FALSE(context.HasOverlay());
    EXPECT_EQ(a.GetContext(), nullptr);

    a.SetContext(nullptr);
    EXPECT_EQ(a.GetContext(), nullptr);
}

TEST(OverlayContext, ContextSwitchesOverlayButOverlayKeepsContext) {
    MemoryContext first(8, 8, 32);
    MemoryContext second(8, 8, 32);
    ulkHostOverlay a;
    ulkHostOverlay b;

    // A context releases its overlay in favour of a new one.
    first.SetOverlay(&a);
    first.SetOverlay(&b);
    EXPECT_TRUE(Bound(first, b));
    EXPECT_EQ(a.GetContext(), nullptr);

    // An overlay ignores a second context.
    b.SetContext(&second);
    EXPECT_TRUE(Bound(first, b));
    EXPECT_FALSE(second.HasOverlay());

    // A context asked to take an overlay bound elsewhere refuses and keeps its own.
    second.SetOverlay(&a);
    second.SetOverlay(&b);
    EXPECT_TRUE(Bound(first, b));
    EXPECT_TRUE(Bound(second, a));

    // An overlay binding to a context held by another overlay takes it over.
    b.ReleaseContext();
    b.SetContext(&second);
    EXPECT_TRUE(Bound(second, b));
    EXPECT_EQ(a.GetContext(), nullptr);

    // Null releases and binds nothing.
    second.SetOverlay(nullptr);
    EXPECT_FALSE(second.HasOverlay());
    EXPECT_EQ(b.GetContext(), nullptr);
}

TEST(OverlayContext, EitherSideMayBeDestroyedFirst) {
    {
        auto context = std::make_unique<MemoryContext>(8, 8, 32);
        auto overlay = std::make_unique<ulkHostOverlay>();
        context->SetOverlay(overlay.get());
        context.reset();
        EXPECT_EQ(overlay->GetContext(), nullptr);
        EXPECT_EQ(overlay->GetOverlayBuffer(), nullptr);
        EXPECT_EQ(overlay->GetNativeWindow(), nullptr);
    }
    {
        auto context = std::make_unique<MemoryContext>(8, 8, 32);
        auto overlay = std::make_unique<ulkHostOverlay>();
        overlay->SetContext(context.get());
        overlay.reset();
        EXPECT_FALSE(context->HasOverlay());
        // The context can bind again without touching the destroyed overlay.
        ulkHostOverlay next;
        context->SetOverlay(&next);
        EXPECT_TRUE(Bound(*context, next));
        context->ReleaseOverlay();
    }
}

TEST(OverlayContext, LivenessMarkers) {
    alignas(MemoryContext) unsigned char contextStorage[sizeof(MemoryContext)];
    alignas(ulkHostOverlay) unsigned char overlayStorage[sizeof(ulkHostOverlay)];
    MemoryContext* context = new (contextStorage) MemoryContext(4, 4, 16);
    ulkHostOverlay* overlay = new (overlayStorage) ulkHostOverlay;
    EXPECT_TRUE(context->IsGoodContext());
    EXPECT_TRUE(overlay->IsGoodOverlay());
    EXPECT_EQ(context->mMagic, 0xFFFFFFFF900D900DULL);
    EXPECT_EQ(overlay->mMagic, 0xFFFFFFFF900D900DULL);

    overlay->SetContext(context);
    overlay->~ulkHostOverlay();
    context->~MemoryContext();
    // What a host reads through a pointer it kept: the storage still holds the markers.
    const auto* deadContext = reinterpret_cast<ulkBaseOverlayContext*>(contextStorage);
    const auto* deadOverlay = reinterpret_cast<ulkHostOverlay*>(overlayStorage);
    EXPECT_EQ(deadContext->mMagic, 0xFFFFFFFFDEADDEADULL);
    EXPECT_EQ(deadOverlay->mMagic, 0xFFFFFFFFDEADDEADULL);
    EXPECT_EQ(deadContext->mOverlay, nullptr);
}

TEST(OverlayContext, CopiesStartUnboundAndAssignmentKeepsBinding) {
    MemoryContext bound(8, 8, 32);
    MemoryContext other(8, 8, 32);
    ulkHostOverlay a;
    ulkHostOverlay b;
    bound.SetOverlay(&a);
    other.SetOverlay(&b);

    MemoryContext copy(bound);
    EXPECT_FALSE(copy.HasOverlay());
    EXPECT_TRUE(copy.IsGoodContext());
    EXPECT_TRUE(Bound(bound, a));

    other = bound;  // the surface is copied, the binding is not
    EXPECT_TRUE(Bound(other, b));
    EXPECT_TRUE(Bound(bound, a));
    copy = bound;
    EXPECT_FALSE(copy.HasOverlay());
}
