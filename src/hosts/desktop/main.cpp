#include <QGuiApplication>
#include <QQmlApplicationEngine>

#include "shell/view/QmlModule.h"

int main(int argc, char** argv) {
  QGuiApplication application(argc, argv);
  QQmlApplicationEngine engine;
  quorl::view::useQmlModule(engine);
  return 0;
}
