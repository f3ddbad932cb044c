// The chart's pictures and camera, checked pixel by pixel on small universes.
#include "ChartFixture.h"
#include "app/ChartReaders.h"

#include "catalog/Star.h"
#include "core/Constants.h"
#include "platform/qt/BitmapImage.h"

#include <cmath>
#include <string>

namespace {

// One frame without moving the camera, as the frame loop would draw it after NextTransform has
// forgotten where the markers were.
void StillFrame(UniverseView* view)
{
    view->selectedPointX = -1;
    view->selectedPointY = -1;
    view->targetPointX = -1;
    view->targetPointY = -1;
    view->Render();
}

} // namespace

TEST_F(ChartTest, AFaintStarAtDepthTwentyFiveIsOnePixelOfIntensityTwentyFour)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->showClipSphere = false;
    view->CalculateLumCache();
    EXPECT_DOUBLE_EQ(view->lumCache[0], 2000.0);
    view->Render();
    // (0, 0, 0) lies 25 pc in front of the camera, at the centre of the 100 x 100 frame.
    EXPECT_EQ(Pixel(view, 49, 49), OnBlack(u->SystemAt(0)->colorTable, 24)); // b = 3.2
    EXPECT_EQ(CountNonZero(view), 1);
}

TEST_F(ChartTest, AtDepthFiveItIsAFourByFourGlow)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->showClipSphere = false;
    view->cameraDistance = 5;
    view->NextTransform();
    view->CalculateLumCache();
    view->Render();
    // b = 80: highest bit 6, size 36 / 8 = 4, sampled from every 16th row and column of the glow.
    const ColorTable* table = u->SystemAt(0)->colorTable;
    const uint8_t* sprite = view->starSprite->Bits();
    int lit = 0;
    for (int j = 0; j < 4; j++) {
        for (int i = 0; i < 4; i++) {
            const uint8_t expected = OnBlack(table, sprite[16 * j * 64 + 16 * i]);
            EXPECT_EQ(Pixel(view, 47 + i, 47 + j), expected) << i << "," << j;
            lit += expected != 0;
        }
    }
    EXPECT_GT(lit, 4);
    EXPECT_EQ(CountNonZero(view), lit);
}

TEST_F(ChartTest, BrightnessSixteenIsASmallGlowAndJustBelowIsTheBrightestPixel)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->showClipSphere = false;
    const ColorTable* table = u->SystemAt(0)->colorTable;

    view->lumFactor = 16 * 625; // b = 16 at depth 25
    view->CalculateLumCache();
    view->Render();
    const uint8_t* sprite = view->starSprite->Bits();
    // Size 2 at (48, 48): the samples of rows and columns 0 and 32.
    EXPECT_EQ(Pixel(view, 48, 48), OnBlack(table, sprite[0]));
    EXPECT_EQ(Pixel(view, 49, 48), OnBlack(table, sprite[32]));
    EXPECT_EQ(Pixel(view, 48, 49), OnBlack(table, sprite[32 * 64]));
    EXPECT_EQ(Pixel(view, 49, 49), OnBlack(table, sprite[32 * 64 + 32]));
    EXPECT_NE(Pixel(view, 49, 49), 0);

    view->lumFactor = 15.99 * 625;
    view->CalculateLumCache();
    view->Render();
    EXPECT_EQ(Pixel(view, 49, 49), OnBlack(table, 120));
    EXPECT_EQ(CountNonZero(view), 1);
}

TEST_F(ChartTest, SystemsOnTheFramesEdgesAreNeitherDrawnNorPicked)
{
    Universe* u = MakeUniverse({
        { "Left", -20, 0, 40, 4.7 }, // x = 0
        { "Right", 20, 0, 40, 4.7 }, // x = 99, the right edge
        { "Top", 0, 20, 40, 4.7 }, // y = 0
        { "Bottom", 0, -20, 40, 4.7 }, // y = 99
        { "Centre", 0, 0, 40, 4.7 },
    });
    UniverseView* view = MakeView(u);
    view->showClipSphere = false;
    LookAlongZ(view);
    view->CalculateLumCache();
    view->mouseInside = true;
    const std::pair<float, float> edges[] = { { 0, 49 }, { 99, 49 }, { 49, 0 }, { 49, 99 } };
    for (auto [x, y] : edges) {
        view->mousePointX = x;
        view->mousePointY = y;
        StillFrame(view);
        EXPECT_EQ(view->Target(), -1) << x << "," << y;
        EXPECT_EQ(Pixel(view, int(x), int(y)), 0) << x << "," << y;
    }
    EXPECT_EQ(CountNonZero(view), 1); // only the centre: b = 2000 / 1600 = 1.25
    view->mousePointX = 51;
    view->mousePointY = 47;
    StillFrame(view);
    EXPECT_EQ(view->Target(), 4);
}

TEST_F(ChartTest, ContrastTwoSquaresLuminosities)
{
    // Luminosities of about 0.5 and 4 (magnitudes 5.45 and 3.19).
    Universe* u = MakeUniverse({ { "Faint", 0, 0, 25, 5.4526 }, { "Bright", 10, 0, 25, 3.1948 } });
    UniverseView* view = MakeView(u);
    view->showClipSphere = false;
    LookAlongZ(view);
    const double faint = u->SystemAt(0)->luminosity, bright = u->SystemAt(1)->luminosity;
    ASSERT_NEAR(faint, 0.5, 0.001);
    ASSERT_NEAR(bright, 4.0, 0.001);

    view->CalculateLumCache();
    view->Render();
    EXPECT_NE(Pixel(view, 49, 49), 0); // b = 1.6
    EXPECT_EQ(CountNonZero(view), 2); // both single pixels: the bright one has b = 12.8

    view->stellarContrast = 2;
    view->CalculateLumCache();
    EXPECT_EQ(view->lumCache[0], 2000 * (faint * faint));
    EXPECT_EQ(view->lumCache[1], 2000 * (bright * bright));
    view->Render();
    EXPECT_EQ(Pixel(view, 49, 49), 0); // b = 0.8: gone
    EXPECT_GT(CountNonZero(view), 2); // b = 51.2: a 3 x 3 glow around (89, 49)
    EXPECT_NE(Pixel(view, 89, 49), 0);
}

TEST_F(ChartTest, PitchVelocityDiesAwayAndYawVelocityStays)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->radialVelocityY = -0.01;
    view->radialVelocityX = 0.1;
    double angle = -0.52; // the chart's starting pitch
    const double expected[] = { 0.09, 0.081, 0.0729 };
    double before = 0.1;
    for (double velocity : expected) {
        view->NextTransform();
        EXPECT_NEAR(view->radialVelocityX.load(), velocity, 1e-15);
        EXPECT_NEAR(velocity / before, 0.9, 1e-12);
        angle += velocity; // each frame turns by the velocity it leaves behind
        EXPECT_NEAR(view->pitch.m[2][1], std::sin(angle), 1e-12);
        EXPECT_NEAR(view->pitch.m[1][1], std::cos(angle), 1e-12);
        EXPECT_EQ(view->radialVelocityY.load(), -0.01);
        before = velocity;
    }
}

TEST_F(ChartTest, CameraDistanceStopsAtFiveHundredthsOfAParsec)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->cameraDistance = 1;
    view->zoomToOrigin = true;
    double previous = 1;
    for (int frame = 0; frame < 40 && view->zoomToOrigin; frame++) {
        view->NextTransform();
        EXPECT_LT(view->cameraDistance, previous);
        EXPECT_GE(view->cameraDistance, 0.05);
        previous = view->cameraDistance;
    }
    EXPECT_FALSE(view->zoomToOrigin);
    EXPECT_EQ(view->cameraDistance, 0.05);
    view->cameraVelocityZ = -10;
    view->NextTransform();
    EXPECT_EQ(view->cameraDistance, 0.05);
    EXPECT_EQ(view->zoomTranslation.m[2][3], 0.05);
}

TEST_F(ChartTest, WithoutTheClippingOverlayHiddenSystemsStayHidden)
{
    Universe* u = MakeUniverse({ { "Near", 0, 0, 25, 4.7 }, { "Far", 6, 0, 30, 2.0 } });
    UniverseView* view = MakeView(u);
    LookAlongZ(view);
    view->CalculateLumCache();
    view->HideGreaterThan(26);
    EXPECT_TRUE(view->drawMask->GetStateSafe(0));
    EXPECT_FALSE(view->drawMask->GetStateSafe(1)); // 30.6 pc from the origin
    const int farX = int(6 * 99 / 30.0 + 49.5);

    view->Render();
    EXPECT_GT(CountIndex(view, 55), 21); // cube, centre cross and read-out

    view->showClipSphere = false;
    view->Render();
    EXPECT_EQ(CountIndex(view, 55), 0);
    EXPECT_EQ(Pixel(view, farX, 49), 0);
    EXPECT_EQ(CountNonZero(view), 1); // the near star alone
}

TEST_F(ChartTest, TheSelectionsZoomInReplaysWhenItComesBack)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 25, 4.7 } });
    UniverseView* view = MakeView(u);
    view->showClipSphere = false;
    LookAlongZ(view);
    view->CalculateLumCache();
    view->selectedSystem = 0;

    // Seven frames with a shrinking rectangle, then the brackets alone.
    std::vector<int> marked;
    for (int frame = 0; frame < 9; frame++) {
        StillFrame(view);
        marked.push_back(CountIndex(view, 42));
    }
    const int brackets = marked.back();
    EXPECT_GT(brackets, 10);
    for (int frame = 0; frame < 7; frame++)
        EXPECT_GT(marked[size_t(frame)], brackets) << frame;
    EXPECT_EQ(marked[7], brackets);
    EXPECT_EQ(view->markerFrames, 0);

    view->transform.InitTranslation(0, 0, -50); // behind the camera
    StillFrame(view);
    EXPECT_EQ(CountIndex(view, 42), 0);
    EXPECT_EQ(view->markerFrames, 7);
    EXPECT_FLOAT_EQ(view->markerScale, 0.7f);

    LookAlongZ(view);
    StillFrame(view);
    EXPECT_GT(CountIndex(view, 42), brackets);
    EXPECT_EQ(view->markerFrames, 6);
}

TEST_F(ChartTest, TheReadOutNamesTheOriginAndDistance)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u, 1, 200);
    view->Render();
    // The read-out's four lines stand at the bottom left in the overlay colour.
    int ink = 0;
    for (int y = 100; y < 199; y++) {
        for (int x = 10; x < 120; x++)
            ink += Pixel(view, x, y) == 55;
    }
    EXPECT_GT(ink, 200);
}

TEST_F(ChartTest, AnOriginNamedWithAccentsIsDrawnInAsciiLettersNotGaps)
{
    // A star named with accents ("B\u00e9l\u00e9nos", HD 8574), written in UTF-8.
    Universe* u = MakeUniverse({ { "B\xc3\xa9l\xc3\xa9nos", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u, 1, kChartWidth);
    view->Render();
    // The read-out as drawn, glyph by glyph in the program's font.
    const QImage drawn = ImageOf(*view->Offscreen());
    const QRect area = ReadOutReader::Area(QPoint(0, 0));
    const std::string text = ReadOutReader().Read(drawn, area.topLeft());
    EXPECT_EQ(text.substr(0, text.find('\n')), "Origin: Belenos") << text;
}

TEST_F(ChartTest, TheReadOutPutsNoMinusSignOnAZero)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    // Level, looking along the world's z axis: right ascension 6 h and a declination of exactly
    // zero, which the arctangent gives as -0.
    view->pitch.InitIdentity();
    view->yaw.InitIdentity();
    std::string text = view->ReadOut();
    EXPECT_NE(text.find("\nRA: 6h 0.0m\nDEC: +0d 0.0'\n"), std::string::npos) << text;

    // Half a degree south the sign stays, on the zero degrees; half a degree north it is a plus.
    view->pitch.InitXRotation(-0.5 * kPI / 180);
    text = view->ReadOut();
    EXPECT_NE(text.find("\nDEC: -0d 30.0'\n"), std::string::npos) << text;
    view->pitch.InitXRotation(0.5 * kPI / 180);
    text = view->ReadOut();
    EXPECT_NE(text.find("\nDEC: +0d 30.0'\n"), std::string::npos) << text;

    // A hundredth of an arc-minute south shows as zero minutes, and so without a sign.
    view->pitch.InitXRotation(-0.01 / 60 * kPI / 180);
    text = view->ReadOut();
    EXPECT_NE(text.find("\nDEC: +0d 0.0'\n"), std::string::npos) << text;
}
