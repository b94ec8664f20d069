#include "vexmap/map_functors.h"

#include <boost/make_shared.hpp>
#include <gtest/gtest.h>

namespace quorvel::vexmap {
namespace {

// Adds a fixed offset, and counts its calls.
class Offset : public MapFunctor {
public:
    Offset(float dx, float dy) : delta(dx, dy) {}
    Vector2d Call(Vector2d const& point) override {
        ++calls;
        return point + delta;
    }
    Vector2d delta;
    int calls = 0;
};

// Doubles a point.
class Doubling : public MapFunctor {
public:
    Vector2d Call(Vector2d const& point) override { return point * 2.0f; }
};

TEST(MapFunctors, AnEmptyChainReturnsItsArgument) {
    MapFunctors chain;
    Vector2d const result = chain.Call(Vector2d(3.0f, -4.0f));
    EXPECT_EQ(3.0f, result.x);
    EXPECT_EQ(-4.0f, result.y);
}

TEST(MapFunctors, LinksApplyFrontToBack) {
    MapFunctors chain;
    chain.PushBack(new Offset(1.0f, 0.0f));
    chain.PushBack(new Doubling);
    Vector2d const result = chain.Call(Vector2d(1.0f, 1.0f));  // (1 + 1) * 2, 1 * 2
    EXPECT_EQ(4.0f, result.x);
    EXPECT_EQ(2.0f, result.y);
}

TEST(MapFunctors, PushFrontAppliesTheNewLinkBeforeAllOthers) {
    MapFunctors chain;
    chain.PushBack(new Doubling);
    chain.PushFront(new Offset(1.0f, 0.0f));
    EXPECT_EQ(4.0f, chain.Call(Vector2d(1.0f, 0.0f)).x);  // (1 + 1) * 2, not 1 * 2 + 1
    chain.PushFront(boost::make_shared<Doubling>());
    EXPECT_EQ(6.0f, chain.Call(Vector2d(1.0f, 0.0f)).x);  // (1 * 2 + 1) * 2
}

TEST(MapFunctors, SharedLinksStayWithTheirOtherOwners) {
    boost::shared_ptr<Offset> const link = boost::make_shared<Offset>(0.0f, 5.0f);
    {
        MapFunctors chain;
        chain.PushBack(link);
        chain.PushBack(boost::shared_ptr<MapFunctor>(link));
        EXPECT_EQ(10.0f, chain.Call(Vector2d()).y);
        EXPECT_EQ(3, link.use_count());
    }
    EXPECT_EQ(1, link.use_count());
    EXPECT_EQ(2, link->calls);
}

TEST(MapFunctors, ACopyOfAChainIsEmpty) {
    MapFunctors chain;
    chain.PushBack(new Offset(1.0f, 1.0f));
    MapFunctors copy(chain);
    EXPECT_EQ(0.0f, copy.Call(Vector2d()).x);
    EXPECT_EQ(1.0f, chain.Call(Vector2d()).x);
}

TEST(MapFunctors, AssignmentLeavesTheTargetsLinks) {
    MapFunctors source;
    source.PushBack(new Offset(1.0f, 0.0f));
    MapFunctors target;
    target.PushBack(new Offset(0.0f, 7.0f));
    target = source;
    Vector2d const result = target.Call(Vector2d());
    EXPECT_EQ(0.0f, result.x);
    EXPECT_EQ(7.0f, result.y);
}

TEST(MapFunctors, ClearReleasesEveryLink) {
    boost::shared_ptr<Offset> const link = boost::make_shared<Offset>(2.0f, 0.0f);
    MapFunctors chain;
    chain.PushBack(link);
    chain.Clear();
    EXPECT_EQ(1, link.use_count());
    EXPECT_EQ(0.0f, chain.Call(Vector2d()).x);
}

TEST(MapFunctors, AChainIsALinkOfAnotherChain) {
    auto inner = boost::make_shared<MapFunctors>();
    inner->PushBack(new Offset(1.0f, 0.0f));
    MapFunctors outer;
    outer.PushBack(inner);
    outer.PushBack(new Doubling);
    EXPECT_EQ(2.0f, outer.Call(Vector2d()).x);
}

}  // namespace
}  // namespace quorvel::vexmap
