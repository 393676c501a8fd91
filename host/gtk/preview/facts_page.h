// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <memory>
#include <string>

#include "platform/file_progress.h"
#include "platform/resource_values.h"
#include "platform/url.h"

namespace vaelo {

/// What is shown of a document that has no preview: icon, name, kind and size, why there is no preview, how far a download
/// has come, and a button that opens the document elsewhere. Main thread.
class FactsPage {
 public:
  /// `arrived` is called when the document that showNotDownloaded() shows has become one that is on this device.
  explicit FactsPage(std::function<void()> arrived);
  ~FactsPage();
  FactsPage(const FactsPage&) = delete;
  FactsPage& operator=(const FactsPage&) = delete;
  GtkWidget* widget() const { return page_; }

  /// `message` is a sentence, or empty.
  void show(const URL& item, const std::string& message);
  /// The same of a document that is not on this device: the progress of its download, or while there is none, what it waits
  /// for.
  void showNotDownloaded(const URL& item);
  void showNothing();
  /// Fails when the document is not on this device.
  static bool isDownloaded(const URL& item);

 private:
  void showValues(const URL& item, const ResourceMap& values, const std::string& message);
  void describe();
  void showBar(bool shows);
  void stopFollowing();
  void downloadEnded();
  void showIcon(const URL& item);
  void followDownload(const URL& item);
  void progressChanged(const std::shared_ptr<Progress>& progress);
  void openElsewhere();

  GtkWidget* page_;
  GtkWidget* box_;
  GtkWidget* bar_;
  GtkWidget* open_;
  std::string path_;
  std::string facts_;    // of the item that shows
  std::string message_;  // likewise
  bool here_ = true;     // likewise
  std::function<void()> arrived_;
  guint arrival_ = 0;
  std::shared_ptr<void> subscription_;
  std::shared_ptr<void> observation_;
};

}  // namespace vaelo
