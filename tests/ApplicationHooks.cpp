#include <FwZel/FwZel.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>

namespace {

/// The object's address as a number: it outlives the object.
uintptr_t address() {
    return reinterpret_cast<uintptr_t>(FwZel::getFwZel());
}

TEST(ApplicationHooks, TheMostRecentlyConstructedObjectIsRememberedAfterItsDestruction) {
    ASSERT_EQ(FwZel::getFwZel(), nullptr);
    const FwZel first;
    EXPECT_EQ(FwZel::getFwZel(), &first);
    auto second = std::make_unique<FwZel>();
    const auto seconds = reinterpret_cast<uintptr_t>(second.get());
    EXPECT_EQ(address(), seconds);
    second.reset();
    EXPECT_EQ(address(), seconds);
}

TEST(ApplicationHooks, DefaultsStartAndDoNothing) {
    FwZel application;
    EXPECT_TRUE(application.onInit(0, nullptr));
    application.onRender(-1);
    application.onResize(0, 0);
    application.onIdle();
    application.onShutdown();
}

TEST(ApplicationHooks, DerivedObjectIsDestroyedThroughTheBase) {
    struct Derived : FwZel {
        explicit Derived(bool& destroyed) : mDestroyed(destroyed) {}
        ~Derived() override { mDestroyed = true; }
        bool& mDestroyed;
    };
    bool destroyed = false;
    std::unique_ptr<FwZel>(new Derived(destroyed)).reset();
    EXPECT_TRUE(destroyed);
}

} // namespace
