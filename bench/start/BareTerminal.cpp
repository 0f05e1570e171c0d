// The least that a program on Qt's event loop needs until its first text in a terminal: the floor of its start.
#include <QCoreApplication>

#include <clocale>
#include <curses.h>

int main(int argc, char** argv)
{
    std::setlocale(LC_ALL, "");
    const QCoreApplication application(argc, argv);
    initscr();
    mvaddstr(0, 0, "Kestrum");
    refresh();
    return QCoreApplication::exec();
}
