// Parsing the command line with Qt's parser, before any application object exists.
#include "app/CommandLine.h"

#include <QCommandLineParser>

namespace {

// A whole number from low to high, or false.
bool ReadCount(const QString& text, int32_t low, int32_t high, int32_t* value)
{
    bool ok = false;
    const qlonglong number = text.trimmed().toLongLong(&ok);
    if (!ok || number < low || number > high)
        return false;
    *value = int32_t(number);
    return true;
}

ParsedCommandLine Mistake(const QString& what)
{
    ParsedCommandLine parsed;
    parsed.exitStatus = 2;
    parsed.error
        = "nightdome: " + what.toStdString() + "\nTry 'nightdome --help' for more information.\n";
    return parsed;
}

} // namespace

const char* ProgramVersion()
{
    return ND_VERSION;
}

const char* ProgramSky()
{
    // Given by the build, which made the default catalogue from the Gaia, the kstars-data or
    // no catalogue at all.
    return ND_SKY;
}

ParsedCommandLine ParseCommandLine(const QStringList& arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        "An interactive 3D map of the stars around the Sun.\n\n"
        "Without options it reads the star catalogue stars.dat found beside the program, in\n"
        "$XDG_DATA_HOME/nightdome, in the installation's share/nightdome or in the nightdome\n"
        "folder of $XDG_DATA_DIRS, in that order. The default catalogue is made from the Gaia\n"
        "DR3 and Hipparcos catalogue of Debian's stellarium-data (Gaia data: ESA/Gaia/DPAC,\n"
        "CC BY-SA 3.0 IGO; packaging GPL-2+), or else the Hipparcos-derived catalogue of\n"
        "Debian's kstars-data, with the nearest and brightest stars of Southern Stars Group;\n"
        "--version names the one this program was built with.");
    const QCommandLineOption help({ "h", "help" }, "Show this help and exit.");
    const QCommandLineOption version({ "v", "version" }, "Show the version and exit.");
    const QCommandLineOption catalogue({ "c", "catalogue" },
        "Read the stars from FILE (the stars.dat format: two lines a star, the name, then "
        "\"class absolute-magnitude x y z\" in parsecs). The other names of its stars (HIP, "
        "HD, GJ, Gaia DR3 ...), which the name query searches too, are read from the file of "
        "the same name ending in .names beside it, when there is one.",
        "FILE");
    const QCommandLineOption generate({ "g", "generate" },
        "Show N random, unnamed systems instead of a catalogue (1 to 1000000), for "
        "demonstrations and measurements.",
        "N");
    const QCommandLineOption threads({ "t", "threads" },
        "Render every chart on N threads (1 to 8; the default is one per processor).", "N");
    // Qt's own, read again by the application object.
    QCommandLineOption platform("platform", "Qt platform plugin.", "name");
    platform.setFlags(QCommandLineOption::HiddenFromHelp);
    QCommandLineOption display("display", "X display.", "display");
    display.setFlags(QCommandLineOption::HiddenFromHelp);
    parser.addOptions({ help, version, catalogue, generate, threads, platform, display });
    // So that Qt's -platform is one option, not -p -l -a ...
    parser.setSingleDashWordOptionMode(QCommandLineParser::ParseAsLongOptions);

    if (!parser.parse(arguments))
        return Mistake(parser.errorText());
    ParsedCommandLine parsed;
    if (parser.isSet(help)) {
        // The usage line names the program as it is installed, however it was started.
        QString text = parser.helpText();
        text.replace(0, text.indexOf('\n'), "Usage: nightdome [options]");
        parsed.output = text.toStdString();
        return parsed;
    }
    if (parser.isSet(version)) {
        parsed.output
            = std::string("nightdome ") + ProgramVersion() + "\nSky: " + ProgramSky() + "\n";
        return parsed;
    }
    if (!parser.positionalArguments().isEmpty()) {
        return Mistake(QString("unexpected argument '%1' (a catalogue is given with --catalogue)")
                           .arg(parser.positionalArguments().first()));
    }
    if (parser.isSet(catalogue) && parser.isSet(generate))
        return Mistake("--catalogue and --generate cannot be used together");
    if (parser.isSet(catalogue)) {
        parsed.options.catalogue = parser.value(catalogue).toStdString();
        if (parsed.options.catalogue.empty())
            return Mistake("--catalogue needs a file name");
    }
    if (parser.isSet(generate)
        && !ReadCount(parser.value(generate), 1, kMaxGeneratedSystems, &parsed.options.generate)) {
        return Mistake(QString("--generate takes a number of systems from 1 to %1, not '%2'")
                           .arg(kMaxGeneratedSystems)
                           .arg(parser.value(generate)));
    }
    if (parser.isSet(threads)
        && !ReadCount(parser.value(threads), 1, kMaxThreadsOption, &parsed.options.threads)) {
        return Mistake(QString("--threads takes a number from 1 to %1, not '%2'")
                           .arg(kMaxThreadsOption)
                           .arg(parser.value(threads)));
    }
    parsed.start = true;
    return parsed;
}
