#include "foundation/object/cmuid.h"
#include "foundation/object/iptr.h"
#include "services/components/fcomponentregistry.h"

#include <gtest/gtest.h>

namespace
{
const FUID kFirst(1, 0, 0, 0), kSecond(2, 0, 0, 0), kOther(3, 0, 0, 0), kUnknown(4, 0, 0, 0);

FUnknown* makeIdentifier()
{
    return static_cast<CmObject*>(new CmUID);
}

FComponentDescription* describe(const char* category, const FUID& uid)
{
    return new FComponentDescription(category, uid, "Name", makeIdentifier);
}
} // namespace

TEST(FComponentRegistry, FindsByCategoryInOrderOfRegistration)
{
    FComponentRegistry registry;
    EXPECT_TRUE(registry.registerComponent(describe("Engine", kFirst)));
    EXPECT_TRUE(registry.registerComponent(describe("Other", kOther)));
    EXPECT_TRUE(registry.registerComponent(describe("Engine", kSecond)));
    EXPECT_EQ(registry.countComponents("Engine"), 2);
    EXPECT_EQ(registry.countComponents("engine"), 0);
    EXPECT_EQ(registry.countComponents(nullptr), 0);
    EXPECT_EQ(registry.getComponent("Engine", 1)->getClassID(), kSecond);
    EXPECT_EQ(registry.getComponent("Engine", 2), nullptr);
    EXPECT_EQ(registry.getComponent("Engine", -1), nullptr);
    EXPECT_TRUE(registry.unregisterComponent(kFirst));
    EXPECT_FALSE(registry.unregisterComponent(kFirst));
    EXPECT_EQ(registry.getComponent("Engine", 0)->getClassID(), kSecond);
}

TEST(FComponentRegistry, RefusesWhatCannotBeFoundAgain)
{
    FComponentRegistry registry;
    EXPECT_TRUE(registry.registerComponent(describe("Engine", kFirst)));
    const IPtr<FComponentDescription> twin = adopt(describe("Other", kFirst));
    twin->addRef();
    EXPECT_FALSE(registry.registerComponent(twin));
    EXPECT_EQ(twin->getRefCount(), 1u) << "the reference is taken all the same";
    EXPECT_FALSE(registry.registerComponent(describe("Engine", FUID())));
    EXPECT_FALSE(registry.registerComponent(nullptr));
}

TEST(FComponentRegistry, MakesComponents)
{
    FComponentRegistry registry;
    registry.registerComponent(describe("Engine", kFirst));
    registry.registerComponent(new FComponentDescription("Engine", kSecond, "No maker", nullptr));
    const IPtr<FUnknown> byCategory = adopt(registry.createComponent("Engine", 0));
    const IPtr<FUnknown> byID = adopt(registry.createUnknownComponent(kFirst));
    EXPECT_TRUE(toFObject(byCategory)->isA("CmUID"));
    EXPECT_TRUE(toFObject(byID)->isA("CmUID"));
    const IPtr<IDependent> view = adopt(registry.createInterface<IDependent>(kFirst));
    ASSERT_TRUE(view);
    EXPECT_EQ(toFObject(view)->getRefCount(), 1u);
    EXPECT_EQ(registry.createComponent("Engine", 1), nullptr);
    FModule* module = reinterpret_cast<FModule*>(&registry);
    EXPECT_EQ(registry.createUnknownComponent(kUnknown, &module), nullptr);
    EXPECT_EQ(module, nullptr);
}
