#include "QueryMatches.h"
#include "UniverseBuilder.h"

#include "catalog/SpectralClass.h"
#include "core/Constants.h"
#include "query/DECQuery.h"
#include "query/DistanceQuery.h"
#include "query/MGQuery.h"
#include "query/RAQuery.h"
#include "query/SCQuery.h"
#include "query/StarNameQuery.h"
#include "query/StarSysMask.h"

#include <gtest/gtest.h>

#include <cctype>
#include <cmath>
#include <cstddef>
#include <cstring>
#include <random>
#include <set>
#include <string>
#include <vector>

namespace {

const TestStar kSunLike { "Star", "G2V", 4.83 };

} // namespace

TEST(StarSysQuery, TypeCodes)
{
    Universe u(20);
    EXPECT_EQ(StarNameQuery(&u).QueryType(), 0x6e616d65u);
    EXPECT_EQ(SCQuery(&u).QueryType(), 0x53437179u);
    EXPECT_EQ(MGQuery(&u).QueryType(), 0x4d477179u);
    EXPECT_EQ(DistanceQuery(&u).QueryType(), 0x44697374u);
    EXPECT_EQ(RAQuery(&u).QueryType(), 0x52417179u);
    EXPECT_EQ(DECQuery(&u).QueryType(), 0x44454379u);
}

TEST(StarSysQuery, ParameterRecordsKeepTheirFieldOrder)
{
    EXPECT_EQ(offsetof(NameQueryParam, mode), 0u);
    EXPECT_LT(offsetof(NameQueryParam, text), offsetof(NameQueryParam, caseSensitive));
    EXPECT_LT(offsetof(SCQueryParam, starMode), offsetof(SCQueryParam, spectralClass));
    EXPECT_EQ(offsetof(MGQueryParam, starMode), 4u);
    EXPECT_EQ(offsetof(MGQueryParam, magnitude), 8u);
    EXPECT_EQ(offsetof(DistanceQueryParam, referenceIndex), 4u);
    EXPECT_EQ(offsetof(DistanceQueryParam, distance), 8u);
    EXPECT_EQ(offsetof(RAQueryParam, rightAscension), 4u);
    EXPECT_EQ(offsetof(DECQueryParam, declination), 4u);
    EXPECT_EQ(sizeof(RAQueryParam), 12u);
}

TEST(StarSysQuery, DistanceIsWithinPointThreeAndComparisonsAreStrict)
{
    Universe u(20);
    const int32_t at98 = AddTestSystem(u, 9.8, 0, 0, { kSunLike });
    const int32_t at102 = AddTestSystem(u, 0, 0, -10.2, { kSunLike });
    const int32_t at969 = AddTestSystem(u, 0, 9.69, 0, { kSunLike });
    const int32_t at1031 = AddTestSystem(u, -10.31, 0, 0, { kSunLike });
    const int32_t at10 = AddTestSystem(u, 6, 8, 0, { kSunLike });
    ASSERT_EQ(SVector(6, 8, 0).Magnitude(), 10.0);

    DistanceQuery query(&u);
    DistanceQueryParam param { kQueryIs, -1, 10 };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { at98, at102, at10 }));
    param.mode = kQueryLessThan;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { at98, at969 }));
    param.mode = kQueryGreaterThan;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { at102, at1031 }));
    param.mode = 3;
    EXPECT_TRUE(Matches(query, &param).empty());
    param.mode = -1;
    EXPECT_TRUE(Matches(query, &param).empty());
    EXPECT_EQ(query.target, 10);
}

TEST(StarSysQuery, DistanceFromTheOriginOrFromASystem)
{
    Universe u(20);
    const int32_t sun = AddTestSystem(u, 0, 0, 0, { kSunLike });
    const int32_t far = AddTestSystem(u, 30, 40, 0, { kSunLike });
    const int32_t near = AddTestSystem(u, 30, 40, 2, { kSunLike });

    DistanceQuery query(&u);
    DistanceQueryParam param { kQueryIs, -1, 0 };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { sun }));
    EXPECT_EQ(query.reference.x, 0);
    EXPECT_EQ(query.reference.y, 0);
    EXPECT_EQ(query.reference.z, 0);

    param.referenceIndex = far;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { far }));
    EXPECT_EQ(query.reference.y, 40);
    param.distance = 2;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { near }));
    param.distance = 50;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { sun }));

    // Back to the origin: the reference of the previous run does not stay.
    param.referenceIndex = -5;
    param.distance = 50;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { far, near }));
}

TEST(StarSysQuery, MagnitudeIsWithinFiveHundredths)
{
    Universe u(20);
    const int32_t m480 = AddTestSystem(u, 1, 0, 0, { { "a", "G2", 4.80 } });
    const int32_t m486 = AddTestSystem(u, 2, 0, 0, { { "b", "G2", 4.86 } });
    const int32_t m477 = AddTestSystem(u, 3, 0, 0, { { "c", "G2", 4.77 } });
    const int32_t m489 = AddTestSystem(u, 4, 0, 0, { { "d", "G2", 4.89 } });
    const int32_t m483 = AddTestSystem(u, 5, 0, 0, { { "e", "G2", 4.83 } });

    MGQuery query(&u);
    MGQueryParam param { kQueryIs, kAnyStarInSystem, 4.83 };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { m480, m486, m483 }));
    param.mode = kQueryLessThan;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { m480, m477 }));
    param.mode = kQueryGreaterThan;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { m486, m489 }));
    param.mode = 9;
    EXPECT_TRUE(Matches(query, &param).empty());
}

TEST(StarSysQuery, SpectralClassIsExactAndOrdersByItsNumber)
{
    Universe u(20);
    const int32_t g2v = AddTestSystem(u, 1, 0, 0, { { "a", "G2V", 4.8 } });
    const int32_t g2 = AddTestSystem(u, 2, 0, 0, { { "b", "G2", 4.8 } });
    const int32_t g3 = AddTestSystem(u, 3, 0, 0, { { "c", "G3V", 5.0 } });
    const int32_t k2 = AddTestSystem(u, 4, 0, 0, { { "d", "K2V", 6.2 } });
    const int32_t f9 = AddTestSystem(u, 5, 0, 0, { { "e", "F9V", 4.0 } });
    // Classes from texts and from numbers meet on one scale.
    const SpectralClass wanted(kClassG, 2);

    SCQuery query(&u);
    SCQueryParam param { kQueryIs, kAnyStarInSystem, &wanted };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { g2v, g2 }));
    EXPECT_DOUBLE_EQ(query.target, 5.2);
    param.mode = kQueryGreaterThan;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { g3, k2 }));
    param.mode = kQueryLessThan;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { f9 }));
    const SpectralClass g21(kClassG, 2.1);
    param.spectralClass = &g21;
    param.mode = kQueryIs;
    EXPECT_TRUE(Matches(query, &param).empty());
    param.mode = 3;
    param.spectralClass = &wanted;
    EXPECT_TRUE(Matches(query, &param).empty());
}

TEST(StarSysQuery, StarModesChooseTheStarsTested)
{
    Universe u(20);
    const int32_t pair = AddTestSystem(u, 1, 0, 0, { { "A", "G2V", 4.8 }, { "B", "M5V", 15 } });
    const int32_t single = AddTestSystem(u, 2, 0, 0, { { "C", "M5V", 15 } });
    const int32_t triple
        = AddTestSystem(u, 3, 0, 0, { { "D", "G2V", 4.8 }, { "E", "K0V", 6 }, { "F", "M5V", 15 } });
    AddTestSystem(u, 4, 0, 0, { { "G", "A0V", 0.6 } });

    MGQuery mg(&u);
    MGQueryParam mgParam { kQueryIs, kFirstStarInSystem, 15 };
    EXPECT_EQ(Matches(mg, &mgParam), (std::set<int32_t> { single }));
    mgParam.starMode = kFirstOrSecondStar;
    EXPECT_EQ(Matches(mg, &mgParam), (std::set<int32_t> { pair, single }));
    mgParam.starMode = kAnyStarInSystem;
    EXPECT_EQ(Matches(mg, &mgParam), (std::set<int32_t> { pair, single, triple }));
    mgParam.starMode = 17; // anything else is the first star only
    EXPECT_EQ(Matches(mg, &mgParam), (std::set<int32_t> { single }));

    const SpectralClass m5("M5V");
    SCQuery sc(&u);
    SCQueryParam scParam { kQueryIs, kFirstStarInSystem, &m5 };
    EXPECT_EQ(Matches(sc, &scParam), (std::set<int32_t> { single }));
    scParam.starMode = kFirstOrSecondStar;
    EXPECT_EQ(Matches(sc, &scParam), (std::set<int32_t> { pair, single }));
    scParam.starMode = kAnyStarInSystem;
    EXPECT_EQ(Matches(sc, &scParam), (std::set<int32_t> { pair, single, triple }));
    scParam.starMode = -3;
    EXPECT_EQ(Matches(sc, &scParam), (std::set<int32_t> { single }));
}

TEST(StarSysQuery, NameIsWithAndWithoutCase)
{
    Universe u(20);
    const int32_t sun = AddTestSystem(u, 0, 0, 0, { { "The Sun", "G2V", 4.83 } });
    AddTestSystem(u, 1, 0, 0, { { "The Sunny One", "G2V", 4.83 } });
    AddTestSystem(u, 2, 0, 0, { { "The Su", "G2V", 4.83 } });

    StarNameQuery query(&u);
    NameQueryParam param { kNameIs, "the sun", false };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { sun }));
    param.caseSensitive = true;
    EXPECT_TRUE(Matches(query, &param).empty());
    param.text = "The Sun";
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { sun }));
}

TEST(StarSysQuery, NameStartsWithAnEmptyTextSelectsEverySystemWithAMember)
{
    Universe u(20);
    const int32_t named = AddTestSystem(u, 1, 0, 0, { { "Vega", "A0V", 0.58 } });
    const int32_t blank = AddTestSystem(u, 2, 0, 0, { { "", "M5V", 15 } });
    AddTestSystem(u, 3, 0, 0, {}); // no members
    const int32_t pair = AddTestSystem(u, 4, 0, 0, { { "Sirius A", "A1V", 1.42 } });
    u.SystemAt(pair)->AddItem(new Star("Sirius B", "DA2", 11.18, 1));

    StarNameQuery query(&u);
    NameQueryParam param { kNameStartsWith, "", false };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { named, blank, pair }));
    param.caseSensitive = true;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { named, blank, pair }));
    param.text = "sir";
    EXPECT_TRUE(Matches(query, &param).empty());
    param.caseSensitive = false;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { pair }));
    param.text = "Sirius Bx";
    EXPECT_TRUE(Matches(query, &param).empty());
}

TEST(StarSysQuery, NameContainsNeverSelectsAnEmptyName)
{
    Universe u(20);
    const int32_t blank = AddTestSystem(u, 1, 0, 0, { { "", "M5V", 15 } });
    const int32_t cyg = AddTestSystem(u, 2, 0, 0, { { "61 Cyg A", "K5V", 7.49 } });
    u.SystemAt(cyg)->AddItem(new Star("61 Cyg B", "K7V", 8.31, 1));
    const int32_t cygnus = AddTestSystem(u, 3, 0, 0, { { "Deneb (Alpha Cygni)", "A2Ia", -8.4 } });

    StarNameQuery query(&u);
    for (const char* text : { "", "a", " ", "M5V" }) {
        for (bool caseSensitive : { false, true }) {
            NameQueryParam param { kNameContains, text, caseSensitive };
            EXPECT_EQ(Matches(query, &param).count(blank), 0u) << '"' << text << '"';
        }
    }
    NameQueryParam param { kNameContains, "", true };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { cyg, cygnus }));
    param.text = "CYG";
    EXPECT_TRUE(Matches(query, &param).empty());
    param.caseSensitive = false;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { cyg, cygnus }));
    param.text = "cyg b";
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { cyg }));
    param.text = "cygni)";
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { cygnus }));
    param.text = "cygni) ";
    EXPECT_TRUE(Matches(query, &param).empty());
    param.mode = 3;
    param.text = "";
    EXPECT_TRUE(Matches(query, &param).empty());
}

TEST(StarSysQuery, NamesFindASystemByAnyOtherNameOfAnyOfItsStars)
{
    Universe u(20);
    const int32_t sun = AddTestSystem(u, 0, 0, 0, { { "The Sun", "G2V", 4.83 } });
    const int32_t alpha = AddTestSystem(
        u, 1, 0, 0, { { "Rigil Kentaurus", "G2V", 4.38 }, { "Toliman", "K1V", 5.71 } });
    const int32_t proxima = AddTestSystem(u, 2, 0, 0, { { "Proxima Centauri", "M5.5Ve", 15.5 } });
    const int32_t plain = AddTestSystem(u, 3, 0, 0, { { "HIP 1", "K0V", 6 } });
    const auto add = [&u](int32_t system, const char* name) {
        ASSERT_TRUE(u.otherNames.Add(system, name, std::strlen(name)));
    };
    add(alpha, "alf Cen A");
    add(alpha, "HIP 71683");
    add(alpha, "HD 128620");
    add(alpha, "alf Cen B"); // the second star's
    add(alpha, "HIP 71681");
    add(proxima, "GJ 551");
    add(proxima, "Gaia DR3 5853498713190525696");

    StarNameQuery query(&u);
    const auto find = [&query](int32_t mode, const char* text, bool caseSensitive) {
        NameQueryParam param { mode, text, caseSensitive };
        return Matches(query, &param);
    };
    using Set = std::set<int32_t>;
    EXPECT_EQ(find(kNameIs, "ALF cen b", false), Set { alpha });
    EXPECT_EQ(find(kNameIs, "ALF cen b", true), Set {});
    EXPECT_EQ(find(kNameIs, "alf Cen B", true), Set { alpha });
    EXPECT_EQ(find(kNameIs, "alf Cen", false), Set {}); // whole names only
    EXPECT_EQ(find(kNameIs, "hip 71683", false), Set { alpha });
    EXPECT_EQ(find(kNameIs, "HD 128620", true), Set { alpha });
    EXPECT_EQ(find(kNameIs, "gj 551", false), Set { proxima });
    EXPECT_EQ(find(kNameIs, "Gaia DR3 5853498713190525696", false), Set { proxima });
    EXPECT_EQ(find(kNameStartsWith, "alf cen", false), Set { alpha });
    EXPECT_EQ(find(kNameStartsWith, "HIP ", false), (Set { alpha, plain }));
    EXPECT_EQ(find(kNameStartsWith, "hip ", true), Set {});
    EXPECT_EQ(find(kNameContains, "cen", false), (Set { alpha, proxima }));
    EXPECT_EQ(find(kNameContains, "Cen B", true), Set { alpha });
    EXPECT_EQ(find(kNameContains, "5853498713190525696", true), Set { proxima });
    EXPECT_EQ(find(kNameContains, "55", false), Set { proxima });
    EXPECT_EQ(find(kNameContains, "", false), (Set { sun, alpha, proxima, plain }));
    EXPECT_EQ(find(3, "GJ 551", false), Set {});
    EXPECT_EQ(find(-1, "", true), Set {});
    // The stars and systems keep their own names.
    EXPECT_STREQ(u.SystemAt(alpha)->GetName(), "Rigil Kentaurus");
    EXPECT_STREQ(u.SystemAt(proxima)->StarAt(0)->GetName(), "Proxima Centauri");
}

namespace {

// The plain reading of the name tests on std::string: whether name passes mode's test for text.
bool PlainNameTest(int32_t mode, std::string name, std::string text, bool caseSensitive)
{
    if (!caseSensitive) {
        for (std::string* s : { &name, &text }) {
            for (char& c : *s)
                c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
        }
    }
    switch (mode) {
    case kNameIs:
        return name == text;
    case kNameStartsWith:
        return name.compare(0, text.size(), text) == 0;
    case kNameContains:
        return !name.empty() && name.find(text) != std::string::npos;
    default:
        return false;
    }
}

} // namespace

TEST(StarSysQuery, OtherNamesAreFoundAsThePlainTestsFindThem)
{
    // Short names from a few letters, digits and a blank, so that texts of up to three of them
    // are found often, several times in one system and across the ends of names; now and then
    // a rare character, which a search looks for first when its text holds one.
    std::mt19937 random(26);
    const char kCommon[] = "aAbB12 ";
    const char kRare[] = "zZ9";
    const auto word = [&](size_t most, uint32_t rareOneIn) {
        std::string w(random() % (most + 1), ' ');
        for (char& c : w) {
            c = random() % rareOneIn == 0 ? kRare[random() % (sizeof kRare - 1)]
                                          : kCommon[random() % (sizeof kCommon - 1)];
        }
        return w;
    };
    Universe u(20);
    std::vector<std::vector<std::string>> names; // every name of each system, its own first
    for (int32_t i = 0; i < 300; i++) {
        std::string own = word(4, 100);
        AddTestSystem(u, i, 0, 0, { { own.c_str(), "G2V", 4.83 } });
        names.push_back({ own });
        const int32_t others = random() % 4 == 0 ? 0 : int32_t(random() % 5);
        for (int32_t k = 0; k < others; k++) {
            std::string other = word(5, 100);
            if (!other.empty() && u.otherNames.Add(i, other.data(), other.size()))
                names.back().push_back(other);
        }
    }
    StarNameQuery query(&u);
    for (int32_t round = 0; round < 600; round++) {
        const std::string text = word(3, 4);
        const int32_t mode = round % 3;
        const bool caseSensitive = round % 2 == 1;
        std::set<int32_t> expected;
        for (int32_t i = 0; i < u.CountItems(); i++) {
            for (const std::string& name : names[size_t(i)]) {
                if (PlainNameTest(mode, name, text, caseSensitive))
                    expected.insert(i);
            }
        }
        NameQueryParam param { mode, text.c_str(), caseSensitive };
        ASSERT_EQ(Matches(query, &param), expected)
            << mode << " '" << text << "' " << caseSensitive;
        // Asked about system by system in the other order, and about every third system only.
        for (int32_t i = u.CountItems() - 1; i >= 0; i--)
            ASSERT_EQ(query.Query(i, &param), expected.count(i) == 1) << i << " '" << text << "'";
        StarSysMask mask(u.CountItems(), true, 0);
        query.GetSysMask(&mask, &param);
        for (int32_t i = 0; i < u.CountItems(); i += 3)
            ASSERT_EQ(query.Query(i, &param), expected.count(i) == 1) << i << " '" << text << "'";
    }
}

TEST(StarSysQuery, NameQueryLowerCasesIntoItsOwnBuffers)
{
    Universe u(20);
    AddTestSystem(u, 1, 0, 0, { { "Barnard's Star", "M4Ve", 13.21 } });
    StarNameQuery query(&u);
    char* const nameBuffer = query.nameBuffer;
    char* const patternBuffer = query.patternBuffer;
    const char* text = "BARNARD";
    NameQueryParam param { kNameStartsWith, text, false };
    EXPECT_EQ(Matches(query, &param).size(), 1u);
    EXPECT_EQ(query.patternLength, 7);
    EXPECT_EQ(query.pattern, patternBuffer);
    EXPECT_STREQ(query.patternBuffer, "barnard");
    EXPECT_EQ(query.candidate, nameBuffer);
    EXPECT_STREQ(query.nameBuffer, "barnard's star");
    EXPECT_EQ(query.nameBuffer, nameBuffer);
    EXPECT_EQ(query.patternBuffer, patternBuffer);

    param.caseSensitive = true;
    EXPECT_TRUE(Matches(query, &param).empty());
    EXPECT_EQ(query.pattern, text);
    EXPECT_EQ(query.candidate, u.SystemAt(0)->StarAt(0)->GetName());
}

TEST(StarSysQuery, RightAscensionRunsFromZeroToTwoPi)
{
    EXPECT_EQ(RAQuery::RightAscension(0, 0), 0);
    EXPECT_DOUBLE_EQ(RAQuery::RightAscension(1, 0), 0);
    EXPECT_DOUBLE_EQ(RAQuery::RightAscension(0, 1), kPI / 2);
    EXPECT_DOUBLE_EQ(RAQuery::RightAscension(-1, 0), kPI);
    EXPECT_DOUBLE_EQ(RAQuery::RightAscension(0, -1), 1.5 * kPI);
    EXPECT_GT(RAQuery::RightAscension(1, -1e-9), kPI);
    EXPECT_LT(RAQuery::RightAscension(1, -1e-9), 2 * kPI);

    Universe u(20);
    const int32_t onAxis = AddTestSystem(u, 0, 5, 0, { kSunLike });
    const int32_t negativeZ = AddTestSystem(u, 3, 1, -4, { kSunLike });
    const int32_t justBelowTwoPi = AddTestSystem(u, 10, 0, -0.01, { kSunLike });
    const int32_t positiveZ = AddTestSystem(u, 3, 1, 4, { kSunLike });

    RAQuery query(&u);
    RAQueryParam param { kQueryGreaterThan, kPI };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { negativeZ, justBelowTwoPi }));
    param.mode = kQueryIs;
    param.rightAscension = 0;
    // The window does not wrap: 2 pi - 0.001 is not near 0.
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { onAxis }));
    param.mode = kQueryLessThan;
    EXPECT_TRUE(Matches(query, &param).empty());
    param.rightAscension = 1;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { onAxis, positiveZ }));
    param.mode = kQueryIs;
    param.rightAscension = std::atan2(4.0, 3.0) + 0.0149;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { positiveZ }));
    param.rightAscension = std::atan2(4.0, 3.0) + 0.0151;
    EXPECT_TRUE(Matches(query, &param).empty());
}

TEST(StarSysQuery, DeclinationIsTheAngleAboveTheXZPlane)
{
    EXPECT_EQ(DECQuery::Declination(0, 5, 0), kPI / 2);
    EXPECT_EQ(DECQuery::Declination(0, -5, 0), -kPI / 2);
    EXPECT_EQ(DECQuery::Declination(3, 0, 4), 0);
    EXPECT_DOUBLE_EQ(DECQuery::Declination(1, 1, 0), kPI / 4);
    EXPECT_TRUE(std::isnan(DECQuery::Declination(0, 0, 0)));

    Universe u(20);
    AddTestSystem(u, 0, 0, 0, { kSunLike }); // at the origin: no declination, no match
    const int32_t north = AddTestSystem(u, 0, 2, 0, { kSunLike });
    const int32_t south = AddTestSystem(u, 1, -1, 0, { kSunLike });
    const int32_t plane = AddTestSystem(u, 0, 0, -7, { kSunLike });

    DECQuery query(&u);
    DECQueryParam param { kQueryGreaterThan, -1 };
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { north, south, plane }));
    param.mode = kQueryLessThan;
    param.declination = 0;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { south }));
    param.mode = kQueryIs;
    param.declination = -kPI / 4 + 0.0199;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { south }));
    param.declination = -kPI / 4 + 0.0201;
    EXPECT_TRUE(Matches(query, &param).empty());
    param.declination = 0;
    EXPECT_EQ(Matches(query, &param), (std::set<int32_t> { plane }));
}

TEST(StarSysQuery, GetSysMaskCountsTheOnesItWrites)
{
    Universe u(20);
    for (int i = 0; i < 150; i++)
        AddTestSystem(u, i * 0.1, 0, 0, { kSunLike });
    DistanceQuery query(&u);
    DistanceQueryParam param { kQueryLessThan, -1, 7.05 };
    StarSysMask mask(u.CountItems(), false, 0);
    mask.SetStateSafe(149, true);
    const int32_t count = query.GetSysMask(&mask, &param);
    EXPECT_EQ(count, 71);
    EXPECT_EQ(mask.CountItems(true), count);
    EXPECT_EQ(mask.FindFirst(), 0);
    EXPECT_FALSE(mask.GetStateSafe(149));
    EXPECT_FALSE(mask.GetStateSafe(71));
    EXPECT_TRUE(mask.GetStateSafe(70));
}

TEST(StarSysQuery, SystemsAddedAfterTheQueryIsMadeAreNotSearched)
{
    Universe u(20);
    AddTestSystem(u, 1, 0, 0, { kSunLike });
    DistanceQuery query(&u);
    EXPECT_EQ(query.systemCount, 1);
    AddTestSystem(u, 2, 0, 0, { kSunLike });
    StarSysMask mask(u.CountItems(), false, 0);
    DistanceQueryParam param { kQueryGreaterThan, -1, 0 };
    EXPECT_EQ(query.GetSysMask(&mask, &param), 1);
    EXPECT_FALSE(mask.GetStateSafe(1));
}

namespace {

// Positions scattered over all directions and distances, some on the axes and planes, plus
// for each system one whose angle lies a hair either side of the given bounds.
void AddScatteredSystems(Universe& u, uint32_t seed)
{
    uint32_t value = seed;
    auto next = [&value] {
        value = value * 1664525u + 1013904223u;
        return (static_cast<double>(value >> 8) / (1u << 24)) * 2 - 1; // [-1, 1)
    };
    for (int i = 0; i < 3000; i++) {
        const double scale = std::pow(10.0, 3 * next());
        AddTestSystem(u, next() * scale, next() * scale, next() * scale, { kSunLike });
    }
    for (double a : { 0.0, -0.0, 1.0, -1.0 }) {
        for (double b : { 0.0, -0.0, 2.0, -2.0 }) {
            AddTestSystem(u, a, b, 0.0, { kSunLike });
            AddTestSystem(u, a, 0.0, b, { kSunLike });
            AddTestSystem(u, 0.0, a, b, { kSunLike });
            AddTestSystem(u, a, -0.0, b, { kSunLike });
        }
    }
}

} // namespace

// The angle queries decide most systems from a cheap key and only the rest from atan2; both
// must give exactly what the plain comparison of the angle gives, right at the bounds too.
TEST(StarSysQuery, AngleQueriesAgreeWithThePlainComparison)
{
    Universe u(5000);
    AddScatteredSystems(u, 12345);
    // Bounds exactly at, and a few units in the last place around, the angles of systems.
    std::vector<double> raTargets = { 0, kPI, 2 * kPI, -0.01, 0.01, 7, 1e-9, 2 * kPI - 1e-9 };
    std::vector<double> decTargets = { 0, kPI / 2, -kPI / 2, 1.6, -1.6, 0.5, -1e-9, 1e-9 };
    for (int i = 0; i < 40; i++) {
        const SVector& p = u.SystemAt(i * 7)->position;
        const double ra = RAQuery::RightAscension(p.x, p.z);
        const double dec = DECQuery::Declination(p.x, p.y, p.z);
        for (double offset : { 0.0, RAQuery::kTolerance, -RAQuery::kTolerance })
            raTargets.push_back(ra + offset);
        for (double offset : { 0.0, DECQuery::kTolerance, -DECQuery::kTolerance })
            decTargets.push_back(dec + offset);
        raTargets.push_back(std::nextafter(ra, 10.0));
        raTargets.push_back(std::nextafter(ra, -10.0));
        decTargets.push_back(std::nextafter(dec, 10.0));
        decTargets.push_back(std::nextafter(dec, -10.0));
    }

    RAQuery ra(&u);
    DECQuery dec(&u);
    StarSysMask mask(u.CountItems(), false, 0);
    for (int32_t mode : { kQueryIs, kQueryLessThan, kQueryGreaterThan }) {
        for (double target : raTargets) {
            RAQueryParam param { mode, target };
            const int32_t count = ra.GetSysMask(&mask, &param);
            int32_t expectedCount = 0;
            for (int32_t i = 0; i < u.CountItems(); i++) {
                const SVector& p = u.SystemAt(i)->position;
                const bool expected = StarSysQuery::Compare(
                    mode, RAQuery::RightAscension(p.x, p.z), target, RAQuery::kTolerance);
                expectedCount += expected;
                ASSERT_EQ(mask.states[i], expected)
                    << "mode " << mode << " target " << target << " system " << i;
            }
            EXPECT_EQ(count, expectedCount);
        }
        for (double target : decTargets) {
            DECQueryParam param { mode, target };
            const int32_t count = dec.GetSysMask(&mask, &param);
            int32_t expectedCount = 0;
            for (int32_t i = 0; i < u.CountItems(); i++) {
                const SVector& p = u.SystemAt(i)->position;
                const bool expected = StarSysQuery::Compare(
                    mode, DECQuery::Declination(p.x, p.y, p.z), target, DECQuery::kTolerance);
                expectedCount += expected;
                ASSERT_EQ(mask.states[i], expected)
                    << "mode " << mode << " target " << target << " system " << i;
            }
            EXPECT_EQ(count, expectedCount);
        }
    }
}

// Query tests against the target field, which GetSysMask sets but a caller may set too.
TEST(StarSysQuery, AngleQueriesFollowTheirTargetField)
{
    Universe u(20);
    const int32_t east = AddTestSystem(u, 0, 0, 3, { kSunLike }); // right ascension pi/2
    RAQuery ra(&u);
    RAQueryParam raParam { kQueryIs, 0 };
    EXPECT_FALSE(ra.Query(east, &raParam));
    ra.target = kPI / 2;
    EXPECT_TRUE(ra.Query(east, &raParam));
    ra.target = 0;
    EXPECT_FALSE(ra.Query(east, &raParam));

    const int32_t north = AddTestSystem(u, 1, 1, 0, { kSunLike }); // declination pi/4
    DECQuery dec(&u);
    DECQueryParam decParam { kQueryGreaterThan, 0 };
    dec.target = 0.7;
    EXPECT_TRUE(dec.Query(north, &decParam));
    dec.target = 0.8;
    EXPECT_FALSE(dec.Query(north, &decParam));
}
