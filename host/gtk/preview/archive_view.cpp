// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/archive_view.h"

#include <adwaita.h>

#include <algorithm>
#include <array>
#include <string_view>

#include "host/gtk/preview/archive_load.h"
#include "host/gtk/preview/archive_rows.h"
#include "host/gtk/preview/text_note.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

constexpr std::array<std::string_view, 38> ArchiveTypes = {
    "application/zip",
    "application/x-tar",
    "application/x-gtar",
    "application/x-compressed-tar",
    "application/x-bzip-compressed-tar",
    "application/x-bzip2-compressed-tar",
    "application/x-xz-compressed-tar",
    "application/x-zstd-compressed-tar",
    "application/x-lzma-compressed-tar",
    "application/x-lzip-compressed-tar",
    "application/x-lz4-compressed-tar",
    "application/x-tarz",
    "application/x-7z-compressed",
    "application/vnd.rar",
    "application/x-rar",
    "application/x-cd-image",
    "application/x-iso9660-image",
    "application/vnd.ms-cab-compressed",
    "application/x-cpio",
    "application/x-cpio-compressed",
    "application/x-bcpio",
    "application/x-sv4cpio",
    "application/x-archive",
    "application/vnd.debian.binary-package",
    "application/x-deb",
    "application/x-rpm",
    "application/x-source-rpm",
    "application/x-lha",
    "application/x-lzh-compressed",
    "application/x-xar",
    "application/java-archive",
    "application/x-java-archive",
    "application/vnd.android.package-archive",
    "application/vnd.comicbook+zip",
    "application/vnd.comicbook-rar",
    "application/x-cb7",
    "application/x-cbt",
    "application/x-xpinstall",
};

constexpr std::array<std::string_view, 10> CompressedTypes = {
    "application/gzip",   "application/x-bzip", "application/x-bzip2", "application/bzip2", "application/x-xz",
    "application/x-lzma", "application/zstd",   "application/x-lzip",  "application/x-lz4", "application/x-compress",
};

constexpr std::size_t FewRows = 60;  // are shown with all folders open

template <std::size_t Count>
bool has(const std::array<std::string_view, Count>& types, const std::string& type) {
  return std::find(types.begin(), types.end(), type) != types.end();
}

// "letter.txt.gz" holds "letter.txt".
std::string withoutExtension(const std::string& name) {
  const std::size_t dot = name.rfind('.');
  return dot == std::string::npos || dot == 0 ? name : name.substr(0, dot);
}

std::string number(std::size_t count) { return numberText(static_cast<std::int64_t>(count)); }

std::string totalOf(const ArchiveListing& listing) {
  std::string total = filled(ngettext("%s file", "%s files", listing.files()), {number(listing.files())});
  if (listing.folders() > 0) {
    total = listedText(total, filled(ngettext("%s folder", "%s folders", listing.folders()), {number(listing.folders())}));
  }
  if (listing.bytes() > 0) {
    const std::string bytes = Platform::current().formatting.byteCount(listing.bytes(), ByteCountStyle::File);
    // TRANSLATORS: %s is how much the content of an archive takes when it is unpacked, as in "12 MB unpacked".
    total = listedText(total, filled(_("%s unpacked"), {bytes}));
  }
  // TRANSLATORS: %s is how many files and folders there are, which becomes a sentence here.
  return filled(_("%s."), {total});
}

const char* remarkFor(ArchiveLoad::End end) {
  switch (end) {
    case ArchiveLoad::End::Whole:
      return "";
    case ArchiveLoad::End::Full:
      return _("There are more, which are not listed.");
    case ArchiveLoad::End::Broken:
      return _("The archive is damaged: what follows can’t be read.");
    case ArchiveLoad::End::Slow:
      return _("There may be more: reading all of the archive would take too long.");
  }
  return "";
}

class ArchiveView : public DocumentView {
 public:
  ArchiveView(const PreviewedDocument& document, DocumentViewEvents events)
      : document_(document),
        events_(std::move(events)),
        box_(GTK_WIDGET(g_object_ref_sink(gtk_box_new(GTK_ORIENTATION_VERTICAL, 0)))),
        stack_(gtk_stack_new()),
        list_(gtk_list_view_new(nullptr, makeArchiveRowFactory())),
        note_(makePreviewNote()) {
    GtkWidget* scrolled = gtk_scrolled_window_new();
    gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scrolled), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
    // As the lists of folders: wider rows are read with effort.
    constexpr int widest = 840;
    GtkWidget* clamp = adw_clamp_scrollable_new();
    adw_clamp_scrollable_set_maximum_size(ADW_CLAMP_SCROLLABLE(clamp), widest);
    adw_clamp_scrollable_set_tightening_threshold(ADW_CLAMP_SCROLLABLE(clamp), widest);
    adw_clamp_scrollable_set_child(ADW_CLAMP_SCROLLABLE(clamp), list_);
    gtk_widget_add_css_class(scrolled, "view");
    gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scrolled), clamp);
    gtk_list_view_set_single_click_activate(GTK_LIST_VIEW(list_), TRUE);
    gtk_accessible_update_property(GTK_ACCESSIBLE(list_), GTK_ACCESSIBLE_PROPERTY_LABEL, document_.name.c_str(), -1);
    g_signal_connect(list_, "activate", G_CALLBACK(+[](GtkListView* list, guint position, gpointer) {
                       const GRef<GtkTreeListRow> row(
                           GTK_TREE_LIST_ROW(g_list_model_get_item(G_LIST_MODEL(gtk_list_view_get_model(list)), position)));
                       gtk_tree_list_row_set_expanded(row.get(), !gtk_tree_list_row_get_expanded(row.get()));
                     }),
                     nullptr);
    g_signal_connect(list_, "map", G_CALLBACK(+[](GtkWidget* list, gpointer) { gtk_widget_grab_focus(list); }), nullptr);
    GtkWidget* empty = adw_status_page_new();
    adw_status_page_set_icon_name(ADW_STATUS_PAGE(empty), "package-x-generic-symbolic");
    adw_status_page_set_title(ADW_STATUS_PAGE(empty), _("Nothing Inside"));
    adw_status_page_set_description(ADW_STATUS_PAGE(empty), _("This archive is empty."));
    gtk_stack_add_named(GTK_STACK(stack_), scrolled, "list");
    gtk_stack_add_named(GTK_STACK(stack_), empty, "empty");
    gtk_widget_set_vexpand(stack_, TRUE);
    gtk_box_append(GTK_BOX(box_), stack_);
    gtk_box_append(GTK_BOX(box_), note_);
    refresh();
  }

  ~ArchiveView() override { g_object_unref(box_); }

  GtkWidget* widget() override { return box_; }

  void refresh() override {
    load_ = std::make_unique<ArchiveLoad>(
        document_.path, has(CompressedTypes, document_.contentType), withoutExtension(document_.name),
        ArchiveLoad::Events{
            [this](std::shared_ptr<const ArchiveListing> listing, ArchiveLoad::End end) { show(std::move(listing), end); },
            [this](const std::string& error) { events_.failed(messageForDecoderError(error)); },
            [this](int entries) {
              events_.progress(filled(ngettext("%s entry so far", "%s entries so far", static_cast<unsigned long>(entries)),
                                      {numberText(entries)}));
            }});
  }

 private:
  void show(std::shared_ptr<const ArchiveListing> listing, ArchiveLoad::End end) {
    const GRef<GtkTreeListModel> rows(makeArchiveRows(listing));
    if (rows_) {
      openArchiveFolders(rows.get(), openArchiveFolders(rows_.get()));
    } else if (listing->files() + listing->folders() <= FewRows) {
      for (guint row = 0; row < g_list_model_get_n_items(G_LIST_MODEL(rows.get())); ++row) expand(rows.get(), row);
    } else if (listing->entry(0).inside.size() == 1) {
      // A folder that holds all the rest is no news.
      expand(rows.get(), 0);
    }
    showRows(rows.get());
    const bool isEmpty = listing->entry(0).inside.empty();
    gtk_stack_set_visible_child_name(GTK_STACK(stack_), isEmpty ? "empty" : "list");
    std::string note = isEmpty ? "" : totalOf(*listing);
    for (const char* remark :
         {isEmpty ? "" : remarkFor(end), listing->hasLocked() ? _("The content is protected by a password.") : ""}) {
      if (*remark) note = note.empty() ? remark : sentences(note, remark);
    }
    setPreviewNote(note_, note);
    events_.shown();
  }

  // An archive that was read anew is shown where it was: what stood first in the window does again.
  void showRows(GtkTreeListModel* rows) {
    const guint first = firstVisibleRow();
    const GRef<GtkNoSelection> selection(gtk_no_selection_new(G_LIST_MODEL(g_object_ref(rows))));
    gtk_list_view_set_model(GTK_LIST_VIEW(list_), GTK_SELECTION_MODEL(selection.get()));
    const guint count = g_list_model_get_n_items(G_LIST_MODEL(rows));
    if (rows_ && count > 0) gtk_widget_activate_action(list_, "list.scroll-to-item", "u", std::min(first, count - 1));
    rows_.reset(GTK_TREE_LIST_MODEL(g_object_ref(rows)));
  }

  guint firstVisibleRow() const {
    GtkAdjustment* place = gtk_scrollable_get_vadjustment(GTK_SCROLLABLE(list_));
    const guint count = rows_ ? g_list_model_get_n_items(G_LIST_MODEL(rows_.get())) : 0;
    const double height = gtk_adjustment_get_upper(place);
    return height > 0 ? static_cast<guint>(gtk_adjustment_get_value(place) / height * count) : 0;
  }

  static void expand(GtkTreeListModel* rows, guint place) {
    const GRef<GtkTreeListRow> row(gtk_tree_list_model_get_row(rows, place));
    if (row) gtk_tree_list_row_set_expanded(row.get(), TRUE);
  }

  PreviewedDocument document_;
  DocumentViewEvents events_;
  GtkWidget* box_;
  GtkWidget* stack_;
  GtkWidget* list_;
  GtkWidget* note_;
  GRef<GtkTreeListModel> rows_;  // that are shown
  std::unique_ptr<ArchiveLoad> load_;
};

}  // namespace

bool showsArchive(const std::string& contentType) {
  return has(ArchiveTypes, contentType) || has(CompressedTypes, contentType);
}

std::unique_ptr<DocumentView> makeArchiveView(const PreviewedDocument& document, DocumentViewEvents events) {
  return std::make_unique<ArchiveView>(document, std::move(events));
}

}  // namespace vaelo
