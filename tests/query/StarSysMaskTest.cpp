#include "query/StarSysMask.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

// The states of a mask as a vector, for whole-mask comparisons.
std::vector<int> States(const StarSysMask& mask)
{
    return std::vector<int>(mask.states, mask.states + mask.systemCount);
}

// A mask of states.size() systems holding exactly the given states.
void Fill(StarSysMask& mask, const std::vector<int>& states)
{
    ASSERT_EQ(static_cast<int32_t>(states.size()), mask.systemCount);
    for (size_t i = 0; i < states.size(); i++)
        mask.SetStateSafe(static_cast<int32_t>(i), states[i] != 0);
}

// A pattern over n systems that is not periodic in any vector width, so both the vector
// chunks and the scalar tail of every operator are exercised.
std::vector<int> Pattern(int n, int seed)
{
    std::vector<int> states(n);
    unsigned value = static_cast<unsigned>(seed) * 2654435761u + 1;
    for (int i = 0; i < n; i++) {
        value = value * 1103515245u + 12345u;
        states[i] = (value >> 16) & 1;
    }
    return states;
}

} // namespace

TEST(StarSysMask, ConstructionSetsEveryStateAndTheFields)
{
    StarSysMask all(5, true, 3);
    EXPECT_EQ(all.universeID, 3);
    EXPECT_EQ(all.GetSystemCount(), 5);
    EXPECT_EQ(States(all), (std::vector<int> { 1, 1, 1, 1, 1 }));
    StarSysMask none(4, false, 0);
    EXPECT_EQ(States(none), (std::vector<int> { 0, 0, 0, 0 }));
    EXPECT_EQ(none.FindFirst(), -1);
    EXPECT_EQ(none.CountItems(false), 4);
}

TEST(StarSysMask, AMaskOfNoSystems)
{
    StarSysMask empty(0, true, 0);
    StarSysMask other(0, false, 0);
    EXPECT_EQ(empty.FindFirst(), -1);
    EXPECT_EQ(empty.CountItems(true), 0);
    EXPECT_EQ(empty.CountItems(false), 0);
    empty = other;
    empty += other;
    empty -= other;
    empty &= other;
    empty |= other;
    empty ^= other;
    ~empty;
    empty.SetAll(true);
    EXPECT_EQ(empty.GetSystemCount(), 0);
    EXPECT_EQ(empty.FindFirst(), -1);
    EXPECT_EQ(empty.CountItems(true), 0);
    EXPECT_EQ(empty.CountItems(false), 0);
    EXPECT_FALSE(empty.GetStateSafe(0));
}

TEST(StarSysMask, OutOfRangeIndicesAreIgnored)
{
    StarSysMask mask(6, false, 0);
    Fill(mask, { 0, 1, 0, 0, 1, 0 });
    const std::vector<int> before = States(mask);
    mask.SetStateSafe(-1, true);
    mask.SetStateSafe(mask.systemCount, true);
    EXPECT_EQ(States(mask), before);
    EXPECT_FALSE(mask.GetStateSafe(-1));
    EXPECT_FALSE(mask.GetStateSafe(mask.systemCount));
    EXPECT_TRUE(mask.GetStateSafe(1));
    EXPECT_FALSE(mask.GetStateSafe(2));
}

TEST(StarSysMask, CountAndFindFirst)
{
    StarSysMask mask(200, false, 0);
    mask.SetStateSafe(150, true);
    mask.SetStateSafe(199, true);
    mask.SetStateSafe(70, true);
    EXPECT_EQ(mask.FindFirst(), 70);
    EXPECT_EQ(mask.CountItems(true), 3);
    EXPECT_EQ(mask.CountItems(false), 197);
    mask.SetStateSafe(70, false);
    mask.SetStateSafe(150, false);
    EXPECT_EQ(mask.FindFirst(), 199);
    mask.SetStateSafe(0, true);
    EXPECT_EQ(mask.FindFirst(), 0);
}

TEST(StarSysMask, ComplementTwiceRestoresAndOfNothingGivesAll)
{
    StarSysMask mask(131, false, 0);
    ~mask;
    EXPECT_EQ(mask.CountItems(true), mask.systemCount);
    EXPECT_EQ(mask.CountItems(true), 131);

    const std::vector<int> states = Pattern(131, 1);
    Fill(mask, states);
    ~mask;
    for (int i = 0; i < 131; i++)
        ASSERT_EQ(mask.states[i], 1 - states[i]) << i;
    ~mask;
    EXPECT_EQ(States(mask), states);
}

TEST(StarSysMask, OperandsThatAreTheMaskItself)
{
    const std::vector<int> states = Pattern(300, 2);
    StarSysMask mask(300, false, 0);
    Fill(mask, states);
    ASSERT_GT(mask.CountItems(true), 0);
    mask -= mask;
    EXPECT_EQ(mask.CountItems(true), 0);

    Fill(mask, states);
    mask ^= mask;
    EXPECT_EQ(mask.CountItems(true), 0);

    StarSysMask plus(300, false, 0);
    StarSysMask orred(300, false, 0);
    Fill(plus, states);
    Fill(orred, states);
    plus += plus;
    orred |= orred;
    EXPECT_EQ(States(plus), States(orred));
    EXPECT_EQ(States(plus), states);
}

TEST(StarSysMask, EveryOperatorMatchesItsTruthTableOverChunksAndTail)
{
    // 64 * 3 + 37 systems: whole chunks and a tail.
    const int n = 229;
    const std::vector<int> a = Pattern(n, 3);
    const std::vector<int> b = Pattern(n, 4);
    StarSysMask other(n, false, 0);
    Fill(other, b);
    StarSysMask mask(n, false, 0);

    auto check = [&](const char* name, auto apply, auto expected) {
        Fill(mask, a);
        apply(mask);
        for (int i = 0; i < n; i++)
            ASSERT_EQ(mask.states[i], expected(a[i], b[i])) << name << " at " << i;
        EXPECT_EQ(States(other), b) << name << " changed its operand";
    };
    check(
        "+=", [&](StarSysMask& m) { m += other; }, [](int x, int y) { return x | y; });
    check(
        "-=", [&](StarSysMask& m) { m -= other; }, [](int x, int y) { return x & !y; });
    check(
        "&=", [&](StarSysMask& m) { m &= other; }, [](int x, int y) { return x & y; });
    check(
        "|=", [&](StarSysMask& m) { m |= other; }, [](int x, int y) { return x | y; });
    check(
        "^=", [&](StarSysMask& m) { m ^= other; }, [](int x, int y) { return x ^ y; });
    check(
        "=", [&](StarSysMask& m) { m = other; }, [](int, int y) { return y; });
    check(
        "~", [&](StarSysMask& m) { ~m; }, [](int x, int) { return 1 - x; });
}

TEST(StarSysMask, DifferenceIsTheShiftOfTheElementByTheOther)
{
    // The rule is a >> b; bytes other than 0 and 1 never occur, but the rule is what it is.
    StarSysMask mask(4, false, 0);
    StarSysMask other(4, false, 0);
    const uint8_t a[4] = { 2, 2, 4, 1 };
    const uint8_t b[4] = { 1, 2, 2, 0 };
    for (int i = 0; i < 4; i++) {
        mask.states[i] = a[i];
        other.states[i] = b[i];
    }
    mask -= other;
    EXPECT_EQ(States(mask), (std::vector<int> { 1, 0, 1, 1 }));
}

TEST(StarSysMask, CopyKeepsTheCountAndUniverseOfTheTarget)
{
    StarSysMask source(8, false, 5);
    Fill(source, { 1, 0, 0, 1, 1, 0, 1, 0 });
    StarSysMask target(8, true, 2);
    target = source;
    EXPECT_EQ(States(target), States(source));
    EXPECT_EQ(target.universeID, 2);
    EXPECT_EQ(target.GetSystemCount(), 8);
    EXPECT_EQ(source.universeID, 5);
}

TEST(StarSysMask, SameUniverseAssigns)
{
    StarSysMask mask(3, false, 4);
    EXPECT_FALSE(mask.SameUniverse(0));
    EXPECT_EQ(mask.universeID, 0);
    EXPECT_TRUE(mask.SameUniverse(7));
    EXPECT_EQ(mask.universeID, 7);
}

TEST(StarSysMask, OperatorsNormaliseToZeroAndOne)
{
    StarSysMask mask(3, false, 0);
    StarSysMask other(3, false, 0);
    mask.states[0] = 5;
    mask.states[1] = 0;
    mask.states[2] = 9;
    other.states[0] = 3;
    other.states[1] = 8;
    other.states[2] = 0;
    StarSysMask copy(3, false, 0);
    copy = mask;
    copy |= other;
    EXPECT_EQ(States(copy), (std::vector<int> { 1, 1, 1 }));
    copy = mask;
    copy &= other;
    EXPECT_EQ(States(copy), (std::vector<int> { 1, 0, 0 }));
    copy = mask;
    copy ^= other;
    EXPECT_EQ(States(copy), (std::vector<int> { 0, 1, 1 }));
    copy = mask;
    ~copy;
    EXPECT_EQ(States(copy), (std::vector<int> { 0, 1, 0 }));
}
