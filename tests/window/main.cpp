#include <QGuiApplication>

#include <gtest/gtest.h>

#include "support/window/WindowFixture.h"

int main(int argc, char** argv) {
  ::testing::InitGoogleTest(&argc, argv);
  const auto application = quorl::test::makeOffscreenApplication(argc, argv);
  return RUN_ALL_TESTS();
}
