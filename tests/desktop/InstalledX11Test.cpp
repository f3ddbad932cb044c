// The program as a user meets it after `cmake --install`, or unpacked from its package: started
// from another folder, with no catalogue beside it and none in the user's data folder, it finds the
// catalogue installed with it and shows the real sky. The count of systems is read off a list
// window that holds every system: its empty set dropped on its own NOT pad.
#include "app/LabelReader.h"
#include "app/ProgramX11Support.h"

#include <QDir>
#include <QProcessEnvironment>

namespace {

class InstalledProgram : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    void PrepareProgram() override
    {
        const QString program = QString(ND_INSTALL_PREFIX) + "/bin/nightdome";
        ASSERT_TRUE(QFileInfo(program).isExecutable())
            << "not installed: " << program.toStdString();
        // Started from a folder of its own; its data folder is empty, so only the installation
        // can give it a catalogue.
        ASSERT_TRUE(QDir(fDir.path()).mkpath("home/data"));
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert("XDG_DATA_HOME", fDir.filePath("home/data"));
        fProgram.setProcessEnvironment(environment);
        fProgram.setWorkingDirectory(fDir.path());
        fProgram.setProgram(program);
    }
};

} // namespace

TEST_P(InstalledProgram, FindsItsCatalogueAndShowsTheRealSky)
{
    const QString installed = QString(ND_INSTALL_PREFIX) + "/share/nightdome/stars.dat";
    const std::vector<CatalogueSystem> catalogue = ReadCatalogue(installed);
    ASSERT_GT(catalogue.size(), 1000u) << "the installed catalogue is not the real sky";
    ASSERT_EQ(catalogue.front().name, "The Sun");
    const int total = int(catalogue.size());

    ASSERT_TRUE(StartedAtTheSun());
    const unsigned long listWindow = Open(9, "Star List");
    ASSERT_NE(listWindow, 0u) << "no list window opened";
    const QPoint list = Move(listWindow, QPoint(900, 160));
    // The line as it reads with every system, and with one too few or too many.
    const LabelReader counts(kCountLine,
        { QString("Star Systems: %1").arg(total), QString("Star Systems: %1").arg(total - 1),
            QString("Star Systems: %1").arg(total + 1), "Star Systems: 0" });
    EXPECT_EQ(counts.WaitFor(list, 3), 3) << "the new list is not empty";
    Drag(list + kStarDragger, list + kNotPad);
    const int read = counts.WaitFor(list, 0, 20000);
    EXPECT_EQ(read, 0) << "the list of every system does not read \"Star Systems: " << total
                       << "\" (read " << read << ", " << counts.Difference(list, 0)
                       << " pixels differ)";
}

INSTANTIATE_TEST_SUITE_P(Bare, InstalledProgram, ::testing::Values(false));
INSTANTIATE_TEST_SUITE_P(UnderOpenbox, InstalledProgram, ::testing::Values(true));
