// The picture tool: a system named on the command line becomes the origin of its picture.
#include <QImage>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <string>
#include <unistd.h>

namespace {

class ChartshotTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        fFolder = std::filesystem::temp_directory_path()
            / ("nightdome-chartshot-" + std::to_string(getpid()));
        std::filesystem::create_directories(fFolder);
        // The Sun, and one bright star 100 parsecs away toward right ascension 0 h, far off
        // the starting view's axis (which looks toward 6 h).
        // Two more 12.4 and 12.5 parsecs from the Sun, in the starting view seen from 30 pc.
        std::ofstream(fFolder / "stars.dat") << "The Sun\nG2V 4.83 0 0 0\n"
                                                "Beacon\nA0V -5.0 100 0 0\n"
                                                "Near\nA0V -2.0 3 0 12\n"
                                                "Far\nA0V -2.0 3 2 -12\n";
    }
    void TearDown() override { std::filesystem::remove_all(fFolder); }

    // Runs the tool with options; its exit status.
    int Shoot(const std::string& options, const std::string& picture)
    {
        const std::string command = std::string(ND_CHARTSHOT) + " --size=320x240 " + options + " "
            + (fFolder / "stars.dat").string() + " " + (fFolder / picture).string() + " 2> "
            + (fFolder / "err").string();
        const int status = std::system(command.c_str());
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    // The brightest pixel's sum of channels within radius of the picture's centre.
    int BrightestNearCentre(const std::string& picture, int radius)
    {
        const QImage image(QString::fromStdString((fFolder / picture).string()));
        EXPECT_FALSE(image.isNull());
        int brightest = 0;
        for (int y = image.height() / 2 - radius; y <= image.height() / 2 + radius; y++) {
            for (int x = image.width() / 2 - radius; x <= image.width() / 2 + radius; x++) {
                const QRgb p = image.pixel(x, y);
                // The green crosshair at the centre is no star: count only white-ish pixels.
                if (qRed(p) > 100 && qBlue(p) > 100)
                    brightest = std::max(brightest, qRed(p) + qGreen(p) + qBlue(p));
            }
        }
        return brightest;
    }

    // Star pixels (white-ish) farther than radius from the picture's centre.
    int StarPixelsAwayFromCentre(const std::string& picture, int radius)
    {
        const QImage image(QString::fromStdString((fFolder / picture).string()));
        EXPECT_FALSE(image.isNull());
        int count = 0;
        // The read-out's green text at the bottom left is no star either.
        for (int y = 0; y < image.height(); y++) {
            for (int x = 0; x < image.width(); x++) {
                const QRgb p = image.pixel(x, y);
                const int dx = x - image.width() / 2, dy = y - image.height() / 2;
                if (dx * dx + dy * dy > radius * radius && qRed(p) > 100 && qBlue(p) > 100)
                    count++;
            }
        }
        return count;
    }

    std::string Errors()
    {
        std::ifstream in(fFolder / "err");
        return std::string(std::istreambuf_iterator<char>(in), {});
    }

    std::filesystem::path fFolder;
};

TEST_F(ChartshotTest, TheNamedSystemStandsAtTheCentre)
{
    ASSERT_EQ(Shoot("--distance=5", "sun.png"), 0) << Errors();
    ASSERT_EQ(Shoot("--distance=5 --origin=Beacon", "beacon.png"), 0) << Errors();
    // From the Sun the beacon is off to the side and the Sun, 5 pc in front, is dim; from the
    // beacon it blazes at the centre.
    EXPECT_GT(BrightestNearCentre("beacon.png", 6), 600);
    EXPECT_LT(BrightestNearCentre("sun.png", 6), BrightestNearCentre("beacon.png", 6));
}

TEST_F(ChartshotTest, TheClipHidesWhatLiesFartherFromTheOrigin)
{
    ASSERT_EQ(Shoot("--distance=30", "all.png"), 0) << Errors();
    ASSERT_EQ(Shoot("--distance=30 --clip=12.45", "one.png"), 0) << Errors();
    ASSERT_EQ(Shoot("--distance=30 --clip=12", "none.png"), 0) << Errors();
    const int all = StarPixelsAwayFromCentre("all.png", 6),
              one = StarPixelsAwayFromCentre("one.png", 6);
    EXPECT_GT(one, 0);
    EXPECT_LT(one, all);
    EXPECT_EQ(StarPixelsAwayFromCentre("none.png", 6), 0);
}

TEST_F(ChartshotTest, BrightnessMakesTheStarsBrighter)
{
    ASSERT_EQ(Shoot("--distance=30 --brightness=200", "dim.png"), 0) << Errors();
    ASSERT_EQ(Shoot("--distance=30 --brightness=20000", "bright.png"), 0) << Errors();
    EXPECT_LT(StarPixelsAwayFromCentre("dim.png", 0), StarPixelsAwayFromCentre("bright.png", 0));
}

TEST_F(ChartshotTest, AnUnknownNameIsRefused)
{
    EXPECT_EQ(Shoot("--origin=Nowhere", "none.png"), 1);
    EXPECT_NE(Errors().find("no star named 'Nowhere'"), std::string::npos) << Errors();
    EXPECT_FALSE(std::filesystem::exists(fFolder / "none.png"));
}

} // namespace
