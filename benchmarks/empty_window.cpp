// An empty window, to measure a start against.
#include <QApplication>
#include <QScreen>
#include <QWidget>

#include "first_paint.h"

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  QWidget window;
  window.resize(
      QSize(1280, 800).boundedTo(window.screen()->availableSize() - QSize(8, 40)));  // as the program
  const tendril::FirstPaint first_paint;
  window.show();
  return QApplication::exec();
}
