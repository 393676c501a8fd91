// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/preview_page.h"

#include <sys/stat.h>

#include "host/desktop/recent_documents.h"
#include "host/drive/packages.h"
#include "host/gtk/bar_item_widget.h"
#include "host/support/display_name.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr guint LoadingNoticeAfter = 200;  // milliseconds; what is quicker needs no notice

constexpr const char* NoLongerThere = N_("This document is no longer there.");
constexpr const char* FolderNow = N_("There is a folder in this document’s place now.");

constexpr const char* QueriedAttributes = G_FILE_ATTRIBUTE_STANDARD_TYPE "," G_FILE_ATTRIBUTE_STANDARD_CONTENT_TYPE;

}  // namespace

PreviewPage::PreviewPage(std::shared_ptr<PreviewController> controller, std::function<void()> headerChanged,
                         std::chrono::milliseconds patience)
    : controller_(std::move(controller)),
      headerChanged_(std::move(headerChanged)),
      patience_(patience),
      share_([this] { return item(); }),
      facts_([this] { load(); }),
      stack_(GTK_WIDGET(g_object_ref_sink(gtk_stack_new()))),
      loading_(adw_status_page_new()),
      spinner_(gtk_spinner_new()) {
  gtk_widget_set_size_request(spinner_, 48, 48);
  gtk_widget_set_halign(spinner_, GTK_ALIGN_CENTER);
  gtk_accessible_update_property(GTK_ACCESSIBLE(spinner_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Loading"), -1);
  adw_status_page_set_child(ADW_STATUS_PAGE(loading_), spinner_);
  // Empty until the document, or a notice that it takes long, is there to be shown.
  gtk_stack_add_named(GTK_STACK(stack_), gtk_box_new(GTK_ORIENTATION_VERTICAL, 0), "empty");
  gtk_stack_add_named(GTK_STACK(stack_), loading_, "loading");
  gtk_stack_add_named(GTK_STACK(stack_), facts_.widget(), "facts");
  token_ = controller_->previewChanged().connect([this](PreviewController&, PreviewChange change) { changed(change); });
  load();
}

PreviewPage::~PreviewPage() {
  stopLoading();
  dropView();
  g_object_unref(stack_);
}

std::optional<URL> PreviewPage::item() const {
  if (controller_->itemCount() == 0) return std::nullopt;
  return controller_->itemAtIndex(0);
}

std::vector<GtkWidget*> PreviewPage::buttons() const {
  std::vector<GtkWidget*> widgets;
  if (item()) widgets.push_back(makeBarItemWidget(share_.item()));
  for (const BarButtonItemRef& item : controller_->additionalRightBarButtonItems())
    widgets.push_back(makeBarItemWidget(item));
  return widgets;
}

std::vector<GtkWidget*> PreviewPage::viewWidgets() const {
  if (!view_ || gtk_stack_get_visible_child(GTK_STACK(stack_)) != view_->widget()) return {};
  return view_->headerWidgets();
}

void PreviewPage::changed(PreviewChange change) {
  switch (change) {
    case PreviewChange::AllItems:
      return load();
    case PreviewChange::CurrentItem:
      return refresh();
    case PreviewChange::BarButtonItems:
      return headerChanged_();
  }
}

// The same kind of document is read anew in its place, so that the user keeps the place too.
void PreviewPage::refresh() {
  const bool isShown = view_ && item() && gtk_stack_get_visible_child(GTK_STACK(stack_)) == view_->widget();
  isShown ? readInfo(&PreviewPage::infoReadAgain) : load();
}

void PreviewPage::infoReadAgain(GFileInfo* info) {
  reading_.reset();
  const char* type = info ? g_file_info_get_content_type(info) : nullptr;
  if (!type || viewedType_ != type) return load();
  viewedVersion_ = versionOf(viewed_->path());
  view_->refresh();
}

// A document that another program moved goes on where it is: its page, what is looked for in it, the place that plays.
bool PreviewPage::followItem() {
  const std::optional<URL> shown = item();
  const bool isShown = shown && view_ && !reading_ && gtk_stack_get_visible_child(GTK_STACK(stack_)) == view_->widget();
  if (!isShown || shown == viewed_ || shown->pathExtension() != viewed_->pathExtension()) return false;
  const std::optional<FileVersion> there = versionOf(shown->path());
  const bool isSame = there && (there == viewedVersion_ || view_->wrote(shown->path()));
  if (!isSame || !view_->follow(shown->path(), displayNameOf(*shown))) return false;
  viewed_ = *shown;
  noteRecentDocument(*shown);
  return true;
}

void PreviewPage::dropView() {
  if (!view_) return;
  gtk_stack_remove(GTK_STACK(stack_), view_->widget());
  view_.reset();
  headerChanged_();
}

void PreviewPage::stopLoading() {
  if (reading_) g_cancellable_cancel(reading_.get());
  reading_.reset();
  g_clear_handle_id(&loadingTimer_, g_source_remove);
  gtk_spinner_stop(GTK_SPINNER(spinner_));
}

void PreviewPage::load() {
  share_.shownChanged();
  if (followItem()) return;
  stopLoading();
  dropView();
  const std::optional<URL> shown = item();
  if (!shown) {
    facts_.showNothing();
    gtk_stack_set_visible_child(GTK_STACK(stack_), facts_.widget());
    return;
  }
  noteRecentDocument(*shown);
  if (!FactsPage::isDownloaded(*shown)) {
    facts_.showNotDownloaded(*shown);
    gtk_stack_set_visible_child(GTK_STACK(stack_), facts_.widget());
    return headerChanged_();
  }
  showLoadingSoon();
  readInfo(&PreviewPage::infoRead);
}

void PreviewPage::readInfo(InfoRead done) {
  struct Asked {
    PreviewPage* page;
    InfoRead done;
  };
  reading_.reset(g_cancellable_new());
  const GRef<GFile> file(g_file_new_for_path(item()->path().c_str()));
  g_file_query_info_async(
      file.get(), QueriedAttributes, G_FILE_QUERY_INFO_NONE, G_PRIORITY_DEFAULT, reading_.get(),
      +[](GObject* source, GAsyncResult* result, gpointer data) {
        const std::unique_ptr<Asked> asked(static_cast<Asked*>(data));
        GError* error = nullptr;
        const GRef<GFileInfo> info(g_file_query_info_finish(G_FILE(source), result, &error));
        const GErrorPtr owned(error);
        // A cancelled one belongs to a page that may be gone.
        if (!g_error_matches(error, G_IO_ERROR, G_IO_ERROR_CANCELLED)) (asked->page->*asked->done)(info.get());
      },
      new Asked{this, done});
}

void PreviewPage::infoRead(GFileInfo* info) {
  reading_.reset();
  if (!info) return showFailure(_(NoLongerThere));
  const char* type = g_file_info_get_content_type(info);
  const bool isFile = g_file_info_get_file_type(info) == G_FILE_TYPE_REGULAR;
  if (isFile && type && hasDocumentView(type)) return makeView(type);
  showFailure("");
}

// What became of the document says more than that it could not be read.
void PreviewPage::showFailure(const std::string& message) {
  struct stat status = {};
  const std::optional<URL> shown = item();
  if (!shown || ::stat(shown->path().c_str(), &status) != 0) return showFacts(_(NoLongerThere));
  showFacts(S_ISDIR(status.st_mode) && !isPackageName(shown->lastPathComponent()) ? _(FolderNow) : message);
}

void PreviewPage::makeView(const std::string& contentType) {
  const std::optional<URL> shown = item();
  if (!shown) return;
  DocumentViewEvents events;
  events.shown = [this] { showView(); };
  events.failed = [this](const std::string& sentence) { showFailure(sentence); };
  events.progress = [this](const std::string& sentence) {
    adw_status_page_set_description(ADW_STATUS_PAGE(loading_), sentence.c_str());
  };
  // Of what the view shows: what is marked as another document comes is saved once that is the item.
  events.shouldSave = [this] { return viewed_ && controller_->shouldSaveEditedItem(*viewed_); };
  adw_status_page_set_description(ADW_STATUS_PAGE(loading_), nullptr);
  const PreviewedDocument document{shown->path(), displayNameOf(*shown), contentType, controller_->canEditItem(*shown),
                                   patience_};
  viewedType_ = contentType;
  viewed_ = *shown;
  viewedVersion_ = versionOf(shown->path());
  view_ = makeDocumentView(document, std::move(events));
  gtk_stack_add_child(GTK_STACK(stack_), view_->widget());
}

void PreviewPage::showView() {
  stopLoading();
  if (!view_ || gtk_stack_get_visible_child(GTK_STACK(stack_)) == view_->widget()) return;
  gtk_stack_set_visible_child(GTK_STACK(stack_), view_->widget());
  facts_.showNothing();  // of a document whose download it followed, nothing more is to be told
  takeFocus();
  headerChanged_();
}

void PreviewPage::takeFocus() {
  GtkWidget* page = gtk_widget_get_parent(stack_);
  if (!page || !gtk_widget_get_mapped(page)) return;
  GtkWidget* focus = gtk_root_get_focus(gtk_widget_get_root(page));
  const bool elsewhere = focus && (!gtk_widget_is_ancestor(focus, page) || gtk_widget_is_ancestor(focus, stack_));
  if (!elsewhere) gtk_widget_child_focus(stack_, GTK_DIR_TAB_FORWARD);
}

// The failed view is called back from itself here, so it goes away later.
void PreviewPage::showFacts(const std::string& message) {
  stopLoading();
  if (const std::optional<URL> shown = item()) facts_.show(*shown, message);
  gtk_stack_set_visible_child(GTK_STACK(stack_), facts_.widget());
  takeFocus();
  headerChanged_();
}

// What the user looks at stays until the document is there: an empty frame in between would hold it up by a whole frame.
void PreviewPage::showLoadingSoon() {
  const bool isSeen = gtk_widget_get_mapped(stack_) && gtk_stack_get_visible_child(GTK_STACK(stack_));
  if (!isSeen) gtk_stack_set_visible_child_name(GTK_STACK(stack_), "empty");
  loadingTimer_ = g_timeout_add(
      LoadingNoticeAfter,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<PreviewPage*>(data);
        self->loadingTimer_ = 0;
        gtk_stack_set_visible_child(GTK_STACK(self->stack_), self->loading_);
        adw_status_page_set_title(ADW_STATUS_PAGE(self->loading_), _("Loading…"));
        gtk_spinner_start(GTK_SPINNER(self->spinner_));
        return G_SOURCE_REMOVE;
      },
      this);
}

}  // namespace vaelo
