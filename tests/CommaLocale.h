// A German locale for the duration of a test, for numbers the user's locale must not change: the
// process locale (what printf follows) and Qt's default locale both write a decimal comma while
// it lives, and are put back when it goes.
#pragma once

#include <QLocale>
#include <clocale>
#include <cstdio>
#include <string>

class CommaLocale {
public:
    CommaLocale()
    {
        const char* previous = std::setlocale(LC_ALL, nullptr);
        fPrevious = previous ? previous : "C";
        for (const char* name : { "de_DE.UTF-8", "de_DE.utf8", "de_DE" }) {
            if (std::setlocale(LC_ALL, name))
                break;
        }
        QLocale::setDefault(QLocale(QLocale::German, QLocale::Germany));
    }
    ~CommaLocale()
    {
        std::setlocale(LC_ALL, fPrevious.c_str());
        QLocale::setDefault(fPreviousQt);
    }

    // Whether printf writes a decimal comma now. A machine without the German locale cannot run
    // the test that needs it: scripts/setup installs it.
    bool Active() const
    {
        char text[16];
        std::snprintf(text, sizeof text, "%.1f", 0.5);
        return std::string(text) == "0,5";
    }

private:
    std::string fPrevious;
    QLocale fPreviousQt;
};
