// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_view.h"

#include "host/gtk/preview/portable_document_screen.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

class PortableDocumentView : public DocumentView {
 public:
  PortableDocumentView(const PreviewedDocument& document, DocumentViewEvents events)
      : screen_(document, std::move(events), &Platform::current().fileCoordination) {}
  GtkWidget* widget() override { return screen_.widget(); }
  void refresh() override { screen_.refresh(); }
  bool follow(const std::string& path, const std::string& name) override { return screen_.follow(path, name); }
  bool wrote(const std::string& path) const override { return screen_.wrote(path); }
  std::vector<GtkWidget*> headerWidgets() override { return screen_.headerWidgets(); }
  bool toggleFind() override { return screen_.toggleFind(); }
  bool closeFind() override { return screen_.closeFind(); }

 private:
  PortableDocumentScreen screen_;
};

}  // namespace

bool showsPortableDocument(const std::string& contentType) {
  return contentType == "application/pdf" || contentType == "application/x-pdf";
}

std::unique_ptr<DocumentView> makePortableDocumentView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<PortableDocumentView>(document, std::move(events));
}

}  // namespace vaelo
