// Prints the faces that the window would use for its texts. A separate program, because a process has one set of
// fonts.
#include "frontends/qt/QtToolkit.h"
#include "frontends/qt/Type.h"

#include <QFontInfo>

#include <cstdio>

int main()
{
    const auto toolkit = kestrum::makeQtToolkit();
    for (const auto& font : {kestrum::systemFont(15), kestrum::boldSystemFont(15), kestrum::Font{"Helvetica", 13}})
        std::puts(QFontInfo(kestrum::qt::fontOf(font)).family().toUtf8().constData());
}
