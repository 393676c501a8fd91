// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/office_view.h"

#include <adwaita.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <string_view>

#include "host/gtk/preview/decoder_process.h"
#include "host/gtk/preview/office_conversion.h"
#include "host/gtk/preview/portable_document_view.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr std::array<std::string_view, 12> OfficeTypes = {
    "application/msword",
    "application/vnd.ms-word",
    "application/vnd.ms-excel",
    "application/vnd.ms-powerpoint",
    "application/rtf",
    "text/rtf",
    "application/vnd.oasis.opendocument.text",
    "application/vnd.oasis.opendocument.spreadsheet",
    "application/vnd.oasis.opendocument.presentation",
    "application/vnd.oasis.opendocument.graphics",
    "application/vnd.visio",
    "application/x-mswrite",
};

// With these come templates, and documents with macros, none of which is run.
constexpr std::array<std::string_view, 8> OfficeTypeBeginnings = {
    "application/vnd.openxmlformats-officedocument.",
    "application/vnd.oasis.opendocument.text-",
    "application/vnd.oasis.opendocument.spreadsheet-",
    "application/vnd.oasis.opendocument.presentation-",
    "application/vnd.oasis.opendocument.graphics-",
    "application/vnd.ms-word.",
    "application/vnd.ms-excel.",
    "application/vnd.ms-powerpoint.",
};

OfficeConversion::Form formOf(const std::string& contentType) {
  const bool isPacked = contentType.starts_with("application/vnd.oasis.opendocument.") ||
                        contentType.starts_with("application/vnd.openxmlformats-officedocument.");
  const bool isFlat = contentType.ends_with("-flat-xml");
  return isPacked && !isFlat ? OfficeConversion::Form::Packed : OfficeConversion::Form::Any;
}

/// The document as a portable one, which has the view for those.
class OfficeView : public DocumentView {
 public:
  OfficeView(const PreviewedDocument& document, DocumentViewEvents events)
      : document_(document), events_(std::move(events)), bin_(GTK_WIDGET(g_object_ref_sink(adw_bin_new()))) {
    convert();
    // Not as an idle source: a conversion that is quick would be first.
    progress_ = g_idle_add_full(
        G_PRIORITY_DEFAULT,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<OfficeView*>(data);
          self->progress_ = 0;
          self->events_.progress(_("Preparing the document to be shown"));
          return G_SOURCE_REMOVE;
        },
        this, nullptr);
  }

  ~OfficeView() override {
    g_clear_handle_id(&progress_, g_source_remove);
    adw_bin_set_child(ADW_BIN(bin_), nullptr);
    g_object_unref(bin_);
  }

  GtkWidget* widget() override { return bin_; }
  void refresh() override { convert(); }
  std::vector<GtkWidget*> headerWidgets() override { return view_ ? view_->headerWidgets() : std::vector<GtkWidget*>(); }
  bool toggleFind() override { return view_ && view_->toggleFind(); }
  bool closeFind() override { return view_ && view_->closeFind(); }

 private:
  void convert() {
    converting_ = std::make_unique<OfficeConversion>(
        document_.path, formOf(document_.contentType),
        [this](const std::string& made, OfficeConversion::Problem problem) { converted(made, problem); });
  }

  void converted(const std::string& made, OfficeConversion::Problem problem) {
    switch (problem) {
      case OfficeConversion::Problem::Failed:
        return events_.failed(_("This document can’t be shown. It may be damaged or protected by a password."));
      case OfficeConversion::Problem::TooSlow:
        return events_.failed(messageForDecoderError(DecoderError::TooSlow));
      case OfficeConversion::Problem::None:
        break;
    }
    if (view_) return showAnew(made);
    shown_ = std::move(converting_);
    shownPath_ = made;
    view_ = makePortableDocumentView({made, document_.name, "application/pdf", false, document_.patience}, events_);
    adw_bin_set_child(ADW_BIN(bin_), view_->widget());
  }

  // In the old one's place, so that its view stays where it is.
  void showAnew(const std::string& made) {
    std::error_code problem;
    std::filesystem::rename(made, shownPath_, problem);
    converting_.reset();
    if (!problem) view_->refresh();
  }

  PreviewedDocument document_;
  DocumentViewEvents events_;
  GtkWidget* bin_;
  guint progress_ = 0;
  std::unique_ptr<OfficeConversion> converting_;
  std::unique_ptr<OfficeConversion> shown_;  // keeps what is shown
  std::string shownPath_;
  std::unique_ptr<DocumentView> view_;
};

}  // namespace

bool showsOffice(const std::string& contentType) {
  const bool isOne = std::find(OfficeTypes.begin(), OfficeTypes.end(), contentType) != OfficeTypes.end() ||
                     std::any_of(OfficeTypeBeginnings.begin(), OfficeTypeBeginnings.end(),
                                 [&](std::string_view beginning) { return contentType.starts_with(beginning); });
  return isOne && OfficeConversion::isAvailable();
}

std::unique_ptr<DocumentView> makeOfficeView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<OfficeView>(document, std::move(events));
}

}  // namespace vaelo
