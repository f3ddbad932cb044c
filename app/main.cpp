// Nightdome: an interactive 3D map of the stars around the Sun.
#include "app/ThreeDNightdomeApp.h"

int main(int argc, char** argv)
{
    auto* application = new ThreeDNightdomeApp(argc, argv);
    application->Run();
    delete application;
    return 0;
}
