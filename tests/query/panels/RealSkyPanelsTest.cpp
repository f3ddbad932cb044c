// The panels over the real sky the build put beside the program: what a user types finds the
// stars they mean.
#include "PanelFixture.h"

#include "query/panels/DistQueryView.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"
#include "widgets/InfoView.h"

#include <QMenu>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <string>

namespace {

class RealSkyPanels : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    static Universe& Sky()
    {
        static Universe universe((std::string(ND_APP_DIR) + "/stars.dat").c_str(), 1000000, 5000);
        return universe;
    }

    void SetUp() override
    {
        ASSERT_TRUE(std::filesystem::exists(std::string(ND_APP_DIR) + "/stars.dat"))
            << "run scripts/setup, then build, to make the catalogue";
        ASSERT_GT(Sky().CountItems(), 100000);
    }

    // The index of the system one of whose stars is named name; -1 when none is.
    static int32_t SystemWithStar(const char* name)
    {
        for (int32_t i = 0; i < Sky().CountItems(); i++) {
            const StarSystem* system = Sky().SystemAt(i);
            for (int32_t s = 0; s < system->CountItems(); s++) {
                if (std::string(system->StarAt(s)->GetName()) == name)
                    return i;
            }
        }
        return -1;
    }
};

const BRect kFrame(10, 10, 370, 60);

} // namespace

TEST_F(RealSkyPanels, SiriusByWholeNameDragsSiriussSystem)
{
    const int32_t sirius = SystemWithStar("Sirius");
    ASSERT_GE(sirius, 0);
    NameQueryView panel(kFrame, "Name Query", &Sky(), nullptr);
    panel.starName->SetText("Sirius");
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarMessage);
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), sirius);
    // Its white dwarf is in the same system.
    EXPECT_EQ(SystemWithStar("Sirius B"), sirius);
}

TEST_F(RealSkyPanels, ProximaByPartOfItsNameDragsProximaCentauri)
{
    const int32_t proxima = SystemWithStar("Proxima Centauri");
    ASSERT_GE(proxima, 0);
    NameQueryView panel(kFrame, "Name Query", &Sky(), nullptr);
    panel.queryType->Menu()->actions()[kNameContains]->trigger();
    panel.starName->SetText("proxima");
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarMessage);
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), proxima);
}

TEST_F(RealSkyPanels, LessThanFiveParsecsFromTheOriginDragsTheSystemsWithinFive)
{
    DistQueryView panel(kFrame, "Dist Query", &Sky(), nullptr);
    // A new panel measures from the first system, the Sun at the origin.
    EXPECT_EQ(panel.referenceLabel->text(), "parsecs from The Sun");
    panel.modeMenu->Menu()->actions()[kQueryLessThan]->trigger();
    panel.distance->SetText("5");
    for (const int32_t reference : { 0, -1 }) {
        panel.SetReferenceSystem(reference);
        const std::optional<CaughtDrag> drag = PressHandle(&panel);
        ASSERT_TRUE(drag.has_value());
        EXPECT_EQ(drag->message.what, kStarArrayMessage);
        const auto* set
            = static_cast<const StarSysMask*>(drag->message.FindPointer(kSystemArrayPtrString));
        ASSERT_NE(set, nullptr);
        int32_t within = 0;
        for (int32_t i = 0; i < Sky().CountItems(); i++) {
            const bool near = Sky().SystemAt(i)->position.Magnitude() < 5.0;
            within += near;
            ASSERT_EQ(set->GetStateSafe(i), near) << Sky().SystemAt(i)->GetName();
        }
        EXPECT_EQ(set->CountItems(true), within);
        EXPECT_EQ(panel.GetSelectedItems(), within);
        // The Sun and the nearby systems: some dozens.
        EXPECT_GT(within, 40);
        EXPECT_LT(within, 60);
    }
}

TEST_F(RealSkyPanels, DroppingSiriusOnTheDistancePanelMeasuresFromSirius)
{
    const int32_t sirius = SystemWithStar("Sirius");
    ASSERT_GE(sirius, 0);
    DistQueryView panel(kFrame, "Dist Query", &Sky(), nullptr);
    Message dropped(kStarMessage);
    dropped.AddInt32(kSystemIndexString, sirius);
    panel.MessageReceived(&dropped);
    EXPECT_EQ(panel.referenceLabel->text(), "parsecs from Sirius");
    EXPECT_STREQ(panel.distance->Text(), "10");
    // Within 1 pc of Sirius: Sirius alone.
    panel.modeMenu->Menu()->actions()[kQueryLessThan]->trigger();
    panel.distance->SetText("1");
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarMessage);
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), sirius);
}

namespace {

// The real sky with the other names of its stars, read from stars.names beside it.
class RealSkyOtherNames : public RealSkyPanels {
protected:
    static Universe& NamedSky()
    {
        static const std::unique_ptr<Universe> universe = [] {
            const std::string dat = std::string(ND_APP_DIR) + "/stars.dat";
            auto u = std::make_unique<Universe>(dat.c_str(), 1000000, 5000);
            std::unique_ptr<std::FILE, int (*)(std::FILE*)> names(
                std::fopen((std::string(ND_APP_DIR) + "/stars.names").c_str(), "rb"), &std::fclose);
            if (names)
                ReadStarNames(
                    names.get(), std::filesystem::file_size(dat), false, u.get(), &sReport);
            return u;
        }();
        return *universe;
    }

    void SetUp() override
    {
        RealSkyPanels::SetUp();
        if (!std::filesystem::exists(std::string(ND_APP_DIR) + "/stars.names"))
            GTEST_SKIP() << "the sky was built without a names file";
        ASSERT_GT(NamedSky().otherNames.Count(), 0);
    }

    // The system the name panel drags one system of for text in mode; -1 for none or a set.
    static int32_t Find(int mode, const char* text)
    {
        NameQueryView panel(kFrame, "Name Query", &NamedSky(), nullptr);
        panel.queryType->Menu()->actions()[mode]->trigger();
        panel.starName->SetText(text);
        const std::optional<CaughtDrag> drag = PressHandle(&panel);
        if (!drag || drag->message.what != kStarMessage)
            return -1;
        return drag->message.FindInt32(kSystemIndexString);
    }

    static inline StarNamesReport sReport;
};

} // namespace

TEST_F(RealSkyOtherNames, TheNamesFileFitsTheSkyAndFindsAStarByEveryName)
{
    EXPECT_TRUE(sReport.Clean()) << sReport.badLines << " bad lines from line "
                                 << sReport.badLinesLine << ", " << sReport.badNames
                                 << " bad names from line " << sReport.badNamesLine;
    const int32_t alpha = SystemWithStar("Rigil Kentaurus");
    const int32_t proxima = SystemWithStar("Proxima Centauri");
    const int32_t barnard = SystemWithStar("Barnard's Star");
    ASSERT_GE(alpha, 0);
    ASSERT_GE(proxima, 0);
    ASSERT_GE(barnard, 0);
    EXPECT_EQ(Find(kNameIs, "HIP 71683"), alpha);
    EXPECT_EQ(Find(kNameIs, "hd 128620"), alpha);
    EXPECT_EQ(Find(kNameIs, "HIP 71681"), alpha); // alpha Centauri B, in the same system
    EXPECT_EQ(Find(kNameIs, "alf1 Cen"), alpha);
    EXPECT_EQ(Find(kNameIs, "GJ 551"), proxima);
    EXPECT_EQ(Find(kNameIs, "Gaia DR3 5853498713190525696"), proxima);
    EXPECT_EQ(Find(kNameIs, "GJ 699"), barnard);
    EXPECT_EQ(Find(kNameIs, "Gaia DR3 4472832130942575872"), barnard);
    // The names alpha Centauri shares with Proxima, its third star, find both systems.
    for (const char* shared : { "Alpha Centauri", "alf Cen" }) {
        NameQueryView panel(kFrame, "Name Query", &NamedSky(), nullptr);
        panel.starName->SetText(shared);
        ASSERT_TRUE(PressHandle(&panel).has_value()) << shared;
        EXPECT_TRUE(panel.IsSystemSelected(alpha)) << shared;
        EXPECT_TRUE(panel.IsSystemSelected(proxima)) << shared;
        EXPECT_EQ(panel.GetSelectedItems(), 2) << shared;
    }
    // The systems keep their own names.
    EXPECT_STREQ(NamedSky().SystemAt(alpha)->GetName(), "Rigil Kentaurus");
    EXPECT_STREQ(NamedSky().SystemAt(proxima)->GetName(), "Proxima Centauri");
}
