// The peer of the workbench's start: a program that shows an empty main window, writes a picture of it and ends.

#include <QApplication>
#include <QMainWindow>
#include <QPixmap>
#include <QTimer>

int main(int argc, char** argv) {
  qputenv("QT_QPA_PLATFORM", "offscreen");
  QApplication application(argc, argv);
  QMainWindow window;
  window.resize(1000, 640);
  window.show();
  QTimer::singleShot(0, [&] {
    window.grab().save(QString::fromLocal8Bit(argv[1]), "PNG");
    QApplication::quit();
  });
  return QApplication::exec();
}
