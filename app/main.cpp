// Nightdome: an interactive 3D map of the stars around the Sun.
#include "app/CommandLine.h"
#include "app/ThreeDNightdomeApp.h"

#include <cstdio>

int main(int argc, char** argv)
{
    // Before the application object, which needs a display: --help and --version do not.
    QStringList arguments;
    for (int i = 0; i < argc; i++)
        arguments << QString::fromLocal8Bit(argv[i]);
    const ParsedCommandLine parsed = ParseCommandLine(arguments);
    std::fputs(parsed.output.c_str(), stdout);
    std::fputs(parsed.error.c_str(), stderr);
    if (!parsed.start)
        return parsed.exitStatus;

    auto* application = new ThreeDNightdomeApp(argc, argv, parsed.options);
    const int status = application->Run();
    delete application;
    return status;
}
