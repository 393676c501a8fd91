// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/preview/document_view.h"
#include "host/gtk/preview/facts_page.h"
#include "host/gtk/preview/file_version.h"
#include "host/gtk/share_button.h"
#include "host/support/glib_ptr.h"
#include "platform/ui/preview_controller.h"

namespace vaelo {

/// The content of a preview's page: the document, or what is known of it. It follows the controller while it lives. Main
/// thread; nothing that reads the document runs there.
class PreviewPage {
 public:
  /// `headerChanged` is called when they would answer something else.
  PreviewPage(std::shared_ptr<PreviewController> controller, std::function<void()> headerChanged,
              std::chrono::milliseconds patience = PreviewedDocument().patience);
  ~PreviewPage();
  PreviewPage(const PreviewPage&) = delete;
  PreviewPage& operator=(const PreviewPage&) = delete;
  GtkWidget* widget() const { return stack_; }

  /// The controller's own bar buttons, and the shown view's widgets, from the outer edge inwards; made anew for each call.
  std::vector<GtkWidget*> buttons() const;
  std::vector<GtkWidget*> viewWidgets() const;
  bool toggleFind() { return view_ && view_->toggleFind(); }
  bool closeFind() { return view_ && view_->closeFind(); }
  /// Reads the document anew.
  void refresh();

 private:
  void changed(PreviewChange change);
  void load();
  bool followItem();
  void dropView();
  /// What the disk says of the shown document; null when it is not there.
  using InfoRead = void (PreviewPage::*)(GFileInfo* info);
  void readInfo(InfoRead done);
  void infoRead(GFileInfo* info);
  void infoReadAgain(GFileInfo* info);
  void showFailure(const std::string& message);
  void makeView(const std::string& contentType);
  void showView();
  /// Gives the keyboard to what shows, when it is at the page's buttons, where it came to when the page did.
  void takeFocus();
  void showFacts(const std::string& message);
  void showLoadingSoon();
  void stopLoading();
  std::optional<URL> item() const;

  std::shared_ptr<PreviewController> controller_;
  std::function<void()> headerChanged_;
  std::chrono::milliseconds patience_;
  ShareButton share_;
  FactsPage facts_;
  GtkWidget* stack_;
  GtkWidget* loading_;
  GtkWidget* spinner_;
  std::unique_ptr<DocumentView> view_;
  std::string viewedType_;
  std::optional<URL> viewed_;
  std::optional<FileVersion> viewedVersion_;
  GRef<GCancellable> reading_;
  guint loadingTimer_ = 0;
  std::shared_ptr<void> token_;
};

}  // namespace vaelo
