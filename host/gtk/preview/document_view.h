// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace vaelo {

/// What a view is told about the document that it shows.
struct PreviewedDocument {
  std::string path;         ///< absolute, of a file that is there
  std::string name;         ///< for a person
  std::string contentType;  ///< a MIME type of the shared-mime-info database
  bool mayBeEdited = false;
  /// With what takes long to be shown. A kind that knows better has less.
  std::chrono::milliseconds patience = std::chrono::seconds(20);
};

/// What a view tells its page. All on the main thread, none before the view's constructor returned.
struct DocumentViewEvents {
  std::function<void()> shown;                                ///< the first screen is painted or about to be
  std::function<void(const std::string& sentence)> failed;    ///< why it can't be shown, for a person
  std::function<void(const std::string& sentence)> progress;  ///< what takes long, while it loads
  std::function<bool()> shouldSave;                           ///< asked before an edit is written to the document
};

/// Shows the content of one document. It loads off the main loop from its construction on, and stops when it goes. Main
/// thread.
class DocumentView {
 public:
  virtual ~DocumentView() = default;
  /// Fills the page; owned by the view.
  virtual GtkWidget* widget() = 0;
  /// Reads the document anew, as it was changed; what the user looks at stays where it is.
  virtual void refresh() = 0;
  /// What is shown stands at this path now, with this name. False when the view can't go on with it, and is to be made anew.
  virtual bool follow(const std::string& /*path*/, const std::string& /*name*/) { return false; }
  /// True when what stands at the path was written by this view.
  virtual bool wrote(const std::string& /*path*/) const { return false; }
  /// Buttons for the end of the header bar, from the outer edge inwards; made anew for each call.
  virtual std::vector<GtkWidget*> headerWidgets() { return {}; }
  /// The user asked to find text, or left it: Ctrl+F, and Escape. False when there is nothing to do.
  virtual bool toggleFind() { return false; }
  virtual bool closeFind() { return false; }
};

/// True when there is a view for documents of this type.
bool hasDocumentView(const std::string& contentType);
/// The view for the document's type; null when there is none.
std::unique_ptr<DocumentView> makeDocumentView(const PreviewedDocument& document, DocumentViewEvents events);

}  // namespace vaelo
