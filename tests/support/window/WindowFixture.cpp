#include "support/window/WindowFixture.h"

#include <QAnimationDriver>
#include <QCoreApplication>
#include <QPoint>
#include <QSignalSpy>
#include <QStyleHints>
#include <QTest>
#include <QVariantAnimation>
#include <algorithm>
#include <fstream>
#include <functional>
#include <mutex>
#include <stdexcept>
#include <utility>

#include <fmt/ranges.h>

#include "app/ApplicationLoop.h"
#include "screens/export/view/SaveText.h"
#include "shell/Window.h"
#include "shell/view/Appearance.h"
#include "shell/view/FocusRing.h"
#include "shell/view/QmlModule.h"

namespace quorl::test {
namespace {

constexpr std::chrono::milliseconds kFrame{16};

std::mutex warningsMutex;
std::vector<std::string> warnings;           // guarded by warningsMutex
QtMessageHandler previousHandler = nullptr;  // set while a collector lives

void collect(QtMsgType type, const QMessageLogContext& context, const QString& message) {
  if (type == QtDebugMsg || type == QtInfoMsg) {
    previousHandler(type, context, message);
    return;
  }
  const std::lock_guard lock(warningsMutex);
  warnings.push_back(message.toStdString());
}

void visit(QQuickItem* item, const std::function<void(QQuickItem*)>& visitor) {
  if (!item->isVisible()) return;
  visitor(item);
  for (QQuickItem* child : item->childItems()) visit(child, visitor);
}

QPoint middleOf(const QQuickItem* item) {
  return item->mapToScene(QPointF(item->width() / 2, item->height() / 2)).toPoint();
}

}  // namespace

WarningCollector::WarningCollector() {
  previousHandler = qInstallMessageHandler(collect);
}

WarningCollector::~WarningCollector() {
  qInstallMessageHandler(std::exchange(previousHandler, nullptr));
}

std::vector<std::string> WarningCollector::take() {
  const std::lock_guard lock(warningsMutex);
  return std::exchange(warnings, {});
}

class SteppedAnimations final : public QAnimationDriver {
 public:
  SteppedAnimations() {
    // Its time counts from the start of the animations that it drives.
    connect(this, &QAnimationDriver::started, this, [this] { elapsed_ = 0; });
    install();
    // Qt adds what it takes by the clock on the wall to start a driver that rests, so this one never does.
    endless_.setStartValue(0.0);
    endless_.setEndValue(1.0);
    endless_.setLoopCount(-1);
    endless_.start();
    QCoreApplication::sendPostedEvents();
    advanceBy(std::chrono::milliseconds(0));
  }
  ~SteppedAnimations() override { uninstall(); }

  void advanceBy(std::chrono::milliseconds duration) {
    if (!isRunning()) return;  // an advance would start it, and count from then on
    elapsed_ += duration.count();
    advanceAnimation();
  }
  void advance() override { advanceAnimation(); }
  qint64 elapsed() const override { return elapsed_; }

 private:
  qint64 elapsed_ = 0;
  QVariantAnimation endless_;
};

WindowPhone::WindowPhone()
    : telephony(phone.time),
      platform_{phone.platform.mainQueue,
                phone.platform.backgroundQueue,
                phone.platform.queues,
                phone.platform.clock,
                phone.properties,
                phone.resources,
                phone.documents,
                phone.strings,
                phone.console,
                alerts_,
                phone.analytics,
                view::SaveText::shared(),
                phone.pasteboard,
                phone.zelkor,
                telephony} {
  Platform::install(&platform_);
  isDevice("mav20");
  for (const char* name : {"Quorl1", "Quorl2"}) {
    const auto path = phone.directory.path() / (std::string(name) + ".deviceconfig");
    std::ofstream(path) << "metrics";
    phone.resources.files[std::string(name) + ".deviceconfig"] = path;
  }
  view::Appearance& appearance = view::Appearance::shared();
  appearance.setDark(false);
  appearance.setFontScale(1);
  appearance.setReducedMotion(false);
  view::FocusRing::shared().setShown(false);
}

WindowPhone::~WindowPhone() {
  engine_.reset();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  shell_.reset();
  application_.reset();
}

void WindowPhone::isDevice(const std::string& chipset) {
  phone.properties.texts["BasebandChipset"] = chipset;
}

void WindowPhone::setSize(int width, int height) {
  size_ = QSize(width, height);
  if (window_ == nullptr) return;
  window_->resize(size_);
  settle();
}

void WindowPhone::launch() {
  animations_ = std::make_unique<SteppedAnimations>();
  application_ = std::make_unique<AppDelegate>();
  ApplicationLoop(*application_).launch();
  shell_ = std::make_unique<view::ShellBinding>(*application_->window(), alerts_);
  engine_ = std::make_unique<QQmlApplicationEngine>();
  view::useQmlModule(*engine_);
  engine_->setInitialProperties(
      {{"shell", QVariant::fromValue(shell_.get())}, {"width", size_.width()}, {"height", size_.height()}});
  engine_->load(QUrl(view::kAppWindowUrl));
  window_ = qobject_cast<QQuickWindow*>(engine_->rootObjects().value(0));
  if (window_ == nullptr || !QTest::qWaitForWindowExposed(window_))
    throw std::runtime_error(fmt::format("no window: {}", fmt::join(takeWarnings(), "; ")));
  settle();
}

void WindowPhone::frame() {
  QCoreApplication::sendPostedEvents();
  QCoreApplication::processEvents();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

void WindowPhone::settle() {
  do {
    frame();
    phone.time.advance(std::chrono::nanoseconds(0));
    frame();
  } while (phone.time.settle() > 0);
}

void WindowPhone::pass(std::chrono::milliseconds duration) {
  settle();
  for (auto left = duration; left.count() > 0; left -= std::min(left, kFrame)) {
    phone.time.advance(std::min(left, kFrame));
    if (animations_) animations_->advanceBy(std::min(left, kFrame));
    frame();
  }
  settle();
}

std::vector<QQuickItem*> WindowPhone::findAll(const QString& objectName, QQuickItem* root) {
  std::vector<QQuickItem*> found;
  visit(root != nullptr ? root : window_->contentItem(), [&](QQuickItem* item) {
    if (item->objectName() == objectName) found.push_back(item);
  });
  return found;
}

QQuickItem* WindowPhone::find(const QString& objectName, QQuickItem* root) {
  const auto found = findAll(objectName, root);
  return found.empty() ? nullptr : found.front();
}

std::string WindowPhone::text(const QString& objectName) {
  const QQuickItem* item = find(objectName);
  return item != nullptr ? item->property("text").toString().toStdString() : "";
}

std::vector<std::string> WindowPhone::texts(QQuickItem* root) {
  std::vector<std::string> found;
  visit(root != nullptr ? root : window_->contentItem(), [&](QQuickItem* item) {
    if (!item->inherits("QQuickText")) return;
    const QString text = item->property("text").toString();
    if (!text.isEmpty()) found.push_back(text.toStdString());
  });
  return found;
}

void WindowPhone::tap(QQuickItem* item) {
  ASSERT_NE(item, nullptr);
  QTest::mouseClick(window_, Qt::LeftButton, Qt::NoModifier, middleOf(item));
  settle();
}

void WindowPhone::longPress(QQuickItem* item) {
  ASSERT_NE(item, nullptr);
  // The toolkit times a press by the time of day, so the press is made a short one.
  QStyleHints& hints = *QGuiApplication::styleHints();
  const int usual = hints.mousePressAndHoldInterval();
  hints.setMousePressAndHoldInterval(1);
  const QPoint at = middleOf(item);
  QTest::mousePress(window_, Qt::LeftButton, Qt::NoModifier, at);
  const QSignalSpy held(item, SIGNAL(pressAndHold()));
  EXPECT_TRUE(QTest::qWaitFor([&] { return !held.empty(); }));
  QTest::mouseRelease(window_, Qt::LeftButton, Qt::NoModifier, at);
  hints.setMousePressAndHoldInterval(usual);
  settle();
}

void WindowPhone::swipe(QQuickItem* item, int dx, int dy) {
  ASSERT_NE(item, nullptr);
  constexpr int kSteps = 12;
  const QPoint from = middleOf(item);
  QTest::mousePress(window_, Qt::LeftButton, Qt::NoModifier, from);
  for (int step = 1; step <= kSteps; ++step) {
    QTest::mouseMove(window_, from + QPoint(dx * step / kSteps, dy * step / kSteps));
    frame();
  }
  QTest::mouseRelease(window_, Qt::LeftButton, Qt::NoModifier, from + QPoint(dx, dy));
  settle();
}

void WindowPhone::key(Qt::Key key, Qt::KeyboardModifiers modifiers) {
  QTest::keyClick(window_, key, modifiers);
  settle();
}

QImage WindowPhone::grab() {
  settle();
  return window_->grabWindow();
}

QImage WindowPhone::drawnAnew() {
  window_->contentItem()->setOpacity(0.5);
  grab();
  window_->contentItem()->setOpacity(1);
  return grab();
}

void WindowTest::TearDown() {
  for (const std::string& warning : takeWarnings()) ADD_FAILURE() << "warned: " << warning;
}

std::unique_ptr<QGuiApplication> makeOffscreenApplication(int& argc, char** argv) {
  qputenv("QT_QPA_PLATFORM", "offscreen");
  qputenv("QT_QUICK_BACKEND", "software");
  qputenv("LC_ALL", "C.UTF-8");
  return std::make_unique<QGuiApplication>(argc, argv);
}

}  // namespace quorl::test
