#include <FwZel/FwZel.h>

#include <gtest/gtest.h>

#include <memory>

namespace {

TEST(ApplicationHooks, TheMostRecentlyConstructedObjectIsRememberedAfterItsDestruction) {
    ASSERT_EQ(FwZel::getFwZel(), nullptr);
    const FwZel first;
    EXPECT_EQ(FwZel::getFwZel(), &first);
    auto second = std::make_unique<FwZel>();
    const FwZel* const address = second.get();
    EXPECT_EQ(FwZel::getFwZel(), address);
    second.reset();
    EXPECT_EQ(FwZel::getFwZel(), address);
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
