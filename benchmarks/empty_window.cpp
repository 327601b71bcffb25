// An empty window, to measure a start against.
#include <QApplication>
#include <QWidget>

#include "first_paint.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  QWidget window;
  window.resize(1280, 800);
  const tendril::FirstPaint first_paint;
  window.show();
  return QApplication::exec();
}
