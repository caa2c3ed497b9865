#pragma once

#include <QObject>
#include <QString>
#include <QUrl>
#include <cstdint>
#include <optional>

#include <QtQml/qqmlregistration.h>

#include "platform/Services.h"
#include "screens/export/TextFile.h"

class QJSEngine;
class QQmlEngine;

namespace quorl::view {

/// The share facility of a system with files: asks where to, and writes the text there without holding up the window.
/// Main thread.
class SaveText final : public QObject, public ShareFacility {
  Q_OBJECT
  QML_ELEMENT
  QML_SINGLETON
  Q_PROPERTY(quorl::view::SaveText::Stage stage READ stage NOTIFY changed)
  Q_PROPERTY(QString folder READ folder WRITE setFolder NOTIFY changed)
  Q_PROPERTY(QUrl folderUrl READ folderUrl NOTIFY changed)
  Q_PROPERTY(QString fileName READ fileName WRITE setFileName NOTIFY changed)
  Q_PROPERTY(QString message READ message NOTIFY changed)

 public:
  enum class Stage {
    Closed,
    Asking,     // for folder and name; `message` tells of an error of the last try, if any
    Replacing,  // whether to, as there is a file of that name
    Writing,
    Saved,
  };
  Q_ENUM(Stage)

  /// The one instance of the process, shared by all engines and owned by none.
  static SaveText& shared();
  /// How an engine gets at it.
  static SaveText* create(QQmlEngine* engine, QJSEngine* scriptEngine);

  /// Asks where to write `text` to, and forgets one that was offered before.
  void share(SharedText text) override;

  Stage stage() const { return stage_; }
  /// Starts as the user's documents folder, and stays as it was chosen last.
  QString folder() const { return folder_; }
  void setFolder(const QString& folder);
  QUrl folderUrl() const;
  QString fileName() const { return fileName_; }
  void setFileName(const QString& fileName);
  QString message() const { return message_; }

  /// Writes the text to `fileName` in `folder`, unless there is such a file.
  Q_INVOKABLE void save();
  /// Writes it over the file that is there.
  Q_INVOKABLE void replace();
  /// Back to asking for a name.
  Q_INVOKABLE void keep();
  /// Takes the folder of a URL, as a folder dialog gives it.
  Q_INVOKABLE void chooseFolder(const QUrl& url);
  /// Closes it. What is being written at the moment is written to its end.
  Q_INVOKABLE void close();

 signals:
  void changed();

 private:
  SaveText();

  void write(Overwrite overwrite);
  void didWrite(const tl::expected<std::uintmax_t, TextFileError>& result);
  void show(Stage stage, QString message = QString());
  QString path() const;

  std::optional<SharedText> text_;
  Stage stage_ = Stage::Closed;
  QString folder_;
  QString fileName_;
  QString message_;
  unsigned turn_ = 0;  // tells a file that is still being written for an earlier text
};

}  // namespace quorl::view
