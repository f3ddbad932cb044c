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
        std::ofstream(fFolder / "stars.dat") << "The Sun\nG2V 4.83 0 0 0\n"
                                                "Beacon\nA0V -5.0 100 0 0\n";
    }
    void TearDown() override { std::filesystem::remove_all(fFolder); }

    // Runs the tool with options; its exit status.
    int Shoot(const std::string& options, const std::string& picture)
    {
        const std::string command = std::string(ND_CHARTSHOT) + " --size=200x150 " + options + " "
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

TEST_F(ChartshotTest, AnUnknownNameIsRefused)
{
    EXPECT_EQ(Shoot("--origin=Nowhere", "none.png"), 1);
    EXPECT_NE(Errors().find("no star named 'Nowhere'"), std::string::npos) << Errors();
    EXPECT_FALSE(std::filesystem::exists(fFolder / "none.png"));
}

} // namespace
