#pragma once

#include "base/Clock.h"
#include "base/Queue.h"
#include "platform/Services.h"
#include "platform/SondrelLibrary.h"
#include "platform/TelephonyClient.h"
#include "platform/ZelkorClient.h"

namespace quorl {

/// Everything that the product asks of its host. The host builds one, installs it before it makes any object of the
/// product, and keeps it and all that it refers to alive for as long as the process runs.
///
/// The process-wide objects of the product are built from the installed platform on their first use.
struct Platform {
  /// Main thread: lifecycle, decoding, row building, telephony, capture, view models.
  Queue& mainQueue;
  /// A queue for work that must not hold up the main thread.
  Queue& backgroundQueue;
  QueueFactory& queues;
  const Clock& clock;
  DeviceProperties& deviceProperties;
  Resources& resources;
  DocumentsDirectory& documents;
  StringTable& strings;
  Console& console;
  AlertPresenter& alerts;
  AnalyticsSink& analytics;
  ShareFacility& share;
  Pasteboard& pasteboard;
  zelkor::client::Library& zelkor;
  HorvaneClientFactory& telephony;
  /// Null on a device without log capture.
  SondrelFactory* sondrel = nullptr;

  /// `platform` must outlive all use of the product. Null uninstalls; tests do so between cases.
  static void install(Platform* platform);
  /// The installed platform. None installed is a fatal programming error.
  static Platform& current();
};

}  // namespace quorl
