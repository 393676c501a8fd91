// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <memory>
#include <optional>
#include <string>

#include "platform/ui/preview_controller.h"

namespace vaelo {

/// The content of a preview's page: icon, name, kind and size of the document, and a button that opens it elsewhere. It follows
/// the controller while it lives. Main thread.
class PreviewPage {
 public:
  explicit PreviewPage(std::shared_ptr<PreviewController> controller);
  ~PreviewPage();
  PreviewPage(const PreviewPage&) = delete;
  PreviewPage& operator=(const PreviewPage&) = delete;
  GtkWidget* widget() const { return page_; }

 private:
  void show();
  void openElsewhere();

  std::shared_ptr<PreviewController> controller_;
  GtkWidget* page_;
  GtkWidget* open_;
  std::shared_ptr<void> token_;
};

}  // namespace vaelo
