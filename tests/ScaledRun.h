// Tests of the program at a scale factor other than 1 on the headless platform. Qt reads the
// factor once, when the application starts, so such a test runs again in a copy of its own test
// program started at that factor (QT_SCALE_FACTOR) on a screen of 1920 x 1080 pixels, and the copy
// makes the checks.
#pragma once

#include <QCoreApplication>
#include <QFile>
#include <QProcess>
#include <QProcessEnvironment>
#include <QTemporaryDir>
#include <gtest/gtest.h>

// Set in the copy.
inline constexpr char kScaledRunVariable[] = "ND_SCALED_RUN";

// Whether this process is the copy, started by RunScaled.
inline bool InScaledRun()
{
    return qEnvironmentVariableIsSet(kScaledRunVariable);
}

// Runs `test` (its whole GoogleTest name, "Suite.Name") in a copy of this program at `scale` on
// a full-HD screen, and expects it to pass there.
inline void RunScaled(const char* test, double scale)
{
    // The screen as the headless platform takes it from a file: its pixels, the program's being
    // these divided by the scale.
    constexpr char kFullHDScreen[]
        = R"({ "screens": [ { "name": "FullHD", "x": 0, "y": 0, "width": 1920, "height": 1080,
               "logicalDpi": 96, "logicalBaseDpi": 96, "dpr": 1 } ] })";
    QTemporaryDir folder;
    ASSERT_TRUE(folder.isValid());
    QFile config(folder.filePath("screen.json"));
    ASSERT_TRUE(config.open(QIODevice::WriteOnly));
    config.write(kFullHDScreen);
    config.close();

    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(kScaledRunVariable, "1");
    environment.insert("QT_SCALE_FACTOR", QString::number(scale));
    environment.insert("QT_QPA_PLATFORM", "offscreen:configfile=" + config.fileName());
    environment.remove("DISPLAY");
    QProcess copy;
    copy.setProcessEnvironment(environment);
    copy.setProcessChannelMode(QProcess::MergedChannels);
    copy.start(QCoreApplication::applicationFilePath(), { QString("--gtest_filter=") + test });
    ASSERT_TRUE(copy.waitForFinished(120000));
    const QString output = QString::fromLocal8Bit(copy.readAll());
    EXPECT_EQ(copy.exitStatus(), QProcess::NormalExit) << output.toStdString();
    EXPECT_EQ(copy.exitCode(), 0) << output.toStdString();
    // The copy ran the test rather than finding nothing to run.
    EXPECT_TRUE(output.contains("[  PASSED  ] 1 test")) << output.toStdString();
}
