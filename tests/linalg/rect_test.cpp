#include <oecore/linalg/rect.h>

#include <gtest/gtest.h>

TEST(Rect, EmptyAndInvalidAreDifferentThings) {
    EXPECT_TRUE(OmbRect(0, 0, 0, 5).isEmpty());
    EXPECT_FALSE(OmbRect(0, 0, 0, 5).isInvalid());
    EXPECT_TRUE(OmbRect::invalid().isEmpty());
    EXPECT_TRUE(OmbRect::invalid().isInvalid());
    EXPECT_FALSE(OmbRect::infinite().isEmpty());
    EXPECT_EQ(OmbRect::infinite().area(), HUGE_VAL);

    // Widening starts from nothing only when the rectangle is invalid.
    OmbRect grown = OmbRect::invalid();
    grown.include({3, 4});
    EXPECT_EQ(grown, OmbRect(3, 4, 3, 4));
    grown.bounds(OmbRect::invalid());
    grown.bounds({-1, 5, 0, 6});
    EXPECT_EQ(grown, OmbRect(-1, 4, 3, 6));
    OmbRect fromEmpty = OmbRect::empty();
    fromEmpty.include({3, 4});
    EXPECT_EQ(fromEmpty, OmbRect(0, 0, 3, 4));
}

TEST(Rect, TouchingCountsOnlyForTheClosedForms) {
    const OmbRect a(0, 0, 10, 10), b(10, 2, 20, 8);
    EXPECT_TRUE(a.overlap(b));
    EXPECT_FALSE(a.strictlyOverlap(b));
    EXPECT_TRUE(a.inside({10, 5}));
    EXPECT_FALSE(a.strictlyInside({10, 5}));
    EXPECT_TRUE(a.covers({0, 0, 10, 3}));
    EXPECT_FALSE(a.covers(b));

    OmbRect clipped = a;
    EXPECT_TRUE(clipped.clipBy(b));
    EXPECT_EQ(clipped, OmbRect(10, 2, 10, 8));
    OmbRect apart = a;
    EXPECT_FALSE(apart.clipBy({11, 0, 12, 1}));
    EXPECT_EQ(apart, a);
    EXPECT_EQ(a.clipByCopy({11, 0, 12, 1}), OmbRect::invalid());
}

TEST(Rect, RotationGivesTheBoundsOfTheTurnedCorners) {
    OmbRect turned(0, 0, 4, 2);
    turned.rotate({2, 1}, 90);
    EXPECT_NEAR(turned.xmin, 1, 1e-12);
    EXPECT_NEAR(turned.ymin, -1, 1e-12);
    EXPECT_NEAR(turned.xmax, 3, 1e-12);
    EXPECT_NEAR(turned.ymax, 3, 1e-12);
}

TEST(Rect, MergeNeedsAWholeCommonEdge) {
    OmbRect r(0, 0, 2, 2);
    EXPECT_FALSE(r.merge({2, 0, 3, 1}));  // half an edge
    EXPECT_FALSE(r.merge({3, 0, 4, 2}));  // a gap
    EXPECT_TRUE(r.merge({2, 0, 3, 2}));
    EXPECT_EQ(r, OmbRect(0, 0, 3, 2));
    EXPECT_TRUE(r.merge({0, -1, 3, 0}));
    EXPECT_EQ(r, OmbRect(0, -1, 3, 2));
}

TEST(Rect, SegmentsAreCutAtTheEdges) {
    const OmbRect r(0, 0, 10, 10);
    OmbPoint a(-5, 5, 0), b(15, 5, 20);
    ASSERT_TRUE(r.clipSegment(a, b));
    EXPECT_EQ(a, OmbPoint(0, 5, 5));
    EXPECT_EQ(b, OmbPoint(10, 5, 15));

    OmbPoint inA(1, 1), inB(2, 3);
    ASSERT_TRUE(r.clipSegment(inA, inB));
    EXPECT_EQ(inB, OmbPoint(2, 3));

    OmbPoint outA(-5, -1), outB(15, -1);  // passes below
    EXPECT_FALSE(r.clipSegment(outA, outB));
    OmbPoint cornerA(-1, 1), cornerB(1, -1);  // touches the corner only
    ASSERT_TRUE(r.clipSegment(cornerA, cornerB));
    EXPECT_EQ(cornerA, cornerB);
    OmbPoint edgeA(-1, 10), edgeB(4, 10);  // along the top edge
    ASSERT_TRUE(r.clipSegment(edgeA, edgeB));
    EXPECT_EQ(edgeA, OmbPoint(0, 10));
}
