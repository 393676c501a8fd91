// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <memory>
#include <string>

#include "platform/file_progress.h"
#include "platform/url.h"

namespace vaelo {

/// What is shown of a document that has no preview: icon, name, kind and size, why there is no preview, how far a download
/// has come, and a button that opens the document elsewhere. Main thread.
class FactsPage {
 public:
  FactsPage();
  ~FactsPage();
  FactsPage(const FactsPage&) = delete;
  FactsPage& operator=(const FactsPage&) = delete;
  GtkWidget* widget() const { return page_; }

  /// `message` is a sentence, or empty.
  void show(const URL& item, const std::string& message);
  void showNothing();
  /// Fails when the document is not on this device.
  static bool isDownloaded(const URL& item);

 private:
  void showIcon(const URL& item);
  void followDownload(const URL& item);
  void progressChanged(const std::shared_ptr<Progress>& progress);
  void openElsewhere();

  GtkWidget* page_;
  GtkWidget* box_;
  GtkWidget* bar_;
  GtkWidget* open_;
  std::string path_;
  std::shared_ptr<void> subscription_;
  std::shared_ptr<void> observation_;
};

}  // namespace vaelo
