#include <oecore/linalg/pointarray.h>

#include <gtest/gtest.h>

#include <thread>
#include <vector>

TEST(PointArray, CopiesShareUntilOneChanges) {
    OmbPointArray a{{1, 2}, {3, 4}};
    const OmbPointArray b = a;
    EXPECT_TRUE(a.sharesStorageWith(b));
    a[0].x = 10;
    EXPECT_FALSE(a.sharesStorageWith(b));
    EXPECT_EQ(b[0], OmbPoint(1, 2));
    EXPECT_EQ(a[0], OmbPoint(10, 2));

    OmbPointArray c = b;
    c.insert(1, {5, 6});
    c.erase(0);
    EXPECT_EQ(c, (OmbPointArray{{5, 6}, {3, 4}}));
    EXPECT_EQ(b.size(), 2u);
    EXPECT_EQ(OmbPointArray(), OmbPointArray{});
    EXPECT_NE(c, b);
}

TEST(PointArray, ThreadsChangeTheirOwnCopies) {
    const OmbPointArray shared(1000);
    std::vector<std::thread> threads;
    std::vector<double> sums(4);
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([&, t] {
            OmbPointArray mine = shared;
            for (OmbPoint& p : mine) p.x = t;
            for (const OmbPoint& p : mine) sums[t] += p.x;
        });
    for (std::thread& t : threads) t.join();
    for (int t = 0; t < 4; ++t) EXPECT_EQ(sums[t], 1000.0 * t);
    for (const OmbPoint& p : shared) ASSERT_EQ(p.x, 0);
}
