// The least that a Qt window needs until its first pixels: the floor of the window's start.
#include <QApplication>
#include <QLabel>

int main(int argc, char** argv)
{
    const QApplication application(argc, argv);
    QLabel label(QStringLiteral("Kestrum"));
    label.resize(480, 800);
    label.show();
    return QApplication::exec();
}
