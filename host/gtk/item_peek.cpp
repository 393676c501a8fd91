// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/item_peek.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstddef>
#include <memory>

#include "host/gtk/list/details_reader.h"
#include "host/gtk/list/folder_reader.h"
#include "host/gtk/list/worker.h"
#include "host/gtk/thumbnails/thumbnail_maker.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "host/support/unique_fd.h"
#include "platform/url.h"

namespace vaelo {

namespace {

constexpr int PeekWidth = 208;
constexpr int PeekHeight = PeekRoom - 12;  // within its own frame
constexpr int PeekIcon = 64;
constexpr int PeekMargin = 6;
constexpr std::size_t PeekLines = 7;
constexpr std::size_t PeekBytes = 2048;

/// What is seen of an item; empty where there is nothing but its icon.
struct Glance {
  GRef<GdkTexture> picture;
  std::string text;
  GRef<GIcon> icon;
  bool isFolder = false;
  bool mayHavePicture = false;
};
using GlanceRef = std::shared_ptr<const Glance>;

std::string shownNames(const std::string& folder) {
  const FolderReading reading = readFolder(folder);
  if (!reading.snapshot) return "";
  if (reading.snapshot->size() == 0) return _("This folder is empty");
  std::string names;
  for (std::size_t i = 0; i < std::min(reading.snapshot->size(), PeekLines); ++i) {
    std::string name = takeString(g_filename_display_name(std::string(reading.snapshot->name(i)).c_str()));
    // Each name has a line, also one that has a line break.
    std::replace(name.begin(), name.end(), '\n', ' ');
    names += (names.empty() ? "" : "\n") + name;
  }
  return names;
}

/// The first bytes of a regular file; of anything else none.
std::string beginningOf(const std::string& path) {
  const UniqueFd file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
  struct stat info {};
  if (!file || fstat(file.get(), &info) != 0 || !S_ISREG(info.st_mode)) return "";
  std::string bytes(PeekBytes, '\0');
  bytes.resize(static_cast<std::size_t>(std::max<ssize_t>(read(file.get(), bytes.data(), bytes.size()), 0)));
  return bytes;
}

std::string firstLines(std::string bytes) {
  if (bytes.size() == PeekBytes) {
    // The last character may be a part of one.
    while (!bytes.empty() && (static_cast<unsigned char>(bytes.back()) & 0xC0) == 0x80) bytes.pop_back();
    if (!bytes.empty()) bytes.pop_back();
  }
  std::erase(bytes, '\r');
  const std::string text = takeString(g_utf8_make_valid(bytes.data(), static_cast<gssize>(bytes.size())));
  std::size_t end = 0;
  for (std::size_t line = 0; line < PeekLines && end != std::string::npos; ++line) {
    end = text.find('\n', line == 0 ? 0 : end + 1);
  }
  return text.substr(0, end);
}

GlanceRef glanceAt(const std::string& path, int pixels) {
  const auto made = std::make_shared<Glance>();
  Glance& glance = *made;
  const URL item(path);
  const auto found = lookUpNames(item.deletingLastPathComponent().path(), {item.lastPathComponent()});
  const bool exists = !found.empty() && found.front().kind;
  const EntryKind kind = exists ? *found.front().kind : EntryKind::Document;
  const std::string bytes = exists && kind == EntryKind::Document ? beginningOf(path) : "";
  gboolean unsure = FALSE;
  const std::string type =
      takeString(g_content_type_guess(path.c_str(), reinterpret_cast<const guchar*>(bytes.data()), bytes.size(), &unsure));
  glance.isFolder = exists && isListedAsFolder(kind);
  glance.icon = GRef<GIcon>(glance.isFolder ? g_themed_icon_new("folder") : g_content_type_get_icon(type.c_str()));
  if (glance.isFolder) glance.text = shownNames(path);
  if (!exists || glance.isFolder || isPromised(kind)) return made;
  const auto details = readDetails(path, kind, pixels);
  if (details->thumbnail) glance.picture = GRef<GdkTexture>(GDK_TEXTURE(g_object_ref(details->thumbnail)));
  glance.mayHavePicture = details->mayHaveThumbnail;
  if (!glance.picture && g_content_type_is_a(type.c_str(), "text/plain")) glance.text = firstLines(bytes);
  return made;
}

/// The widgets of one peek. Belongs to the button.
class ItemPeek {
 public:
  ItemPeek(GtkWidget* overlay, const std::string& path) : overlay_(overlay) {
    const int pixels = PeekWidth * gtk_widget_get_scale_factor(overlay);
    worker_.run([this, path, pixels]() -> std::function<void()> {
      return [this, path, pixels, glance = glanceAt(path, pixels)] {
        show(*glance);
        if (glance->mayHavePicture) makePicture(path, pixels);
      };
    });
  }

 private:
  void makePicture(const std::string& path, int pixels) {
    worker_.run([this, path, pixels]() -> std::function<void()> {
      if (!makeThumbnail(Thumbnailers::installed(), g_get_user_cache_dir(), path, pixels)) return nullptr;
      return [this, glance = glanceAt(path, pixels)] { show(*glance); };
    });
  }

  void show(const Glance& glance) {
    if (shown_) gtk_overlay_remove_overlay(GTK_OVERLAY(overlay_), shown_);
    if (glance.picture) {
      shown_ = gtk_picture_new_for_paintable(GDK_PAINTABLE(glance.picture.get()));
    } else if (!glance.text.empty()) {
      shown_ = gtk_label_new(glance.text.c_str());
      // Each name has its line; what is written goes on in the next, down to where the place ends.
      if (glance.isFolder) gtk_label_set_ellipsize(GTK_LABEL(shown_), PANGO_ELLIPSIZE_END);
      gtk_label_set_wrap(GTK_LABEL(shown_), !glance.isFolder);
      gtk_label_set_wrap_mode(GTK_LABEL(shown_), PANGO_WRAP_WORD_CHAR);
      gtk_label_set_xalign(GTK_LABEL(shown_), 0);
      gtk_label_set_yalign(GTK_LABEL(shown_), 0);
      gtk_widget_add_css_class(shown_, "caption");
    } else {
      shown_ = gtk_image_new_from_gicon(glance.icon.get());
      gtk_image_set_pixel_size(GTK_IMAGE(shown_), PeekIcon);
    }
    gtk_widget_set_size_request(shown_, PeekWidth - 2 * PeekMargin, -1);
    for (void (*set)(GtkWidget*, int) :
         {gtk_widget_set_margin_top, gtk_widget_set_margin_bottom, gtk_widget_set_margin_start, gtk_widget_set_margin_end}) {
      set(shown_, PeekMargin);
    }
    gtk_overlay_add_overlay(GTK_OVERLAY(overlay_), shown_);
  }

  GtkWidget* overlay_;
  GtkWidget* shown_ = nullptr;
  Worker worker_;
};

}  // namespace

GtkWidget* makeItemPeek(const std::string& path, const char* action, int target) {
  GtkWidget* button = gtk_button_new();
  gtk_widget_add_css_class(button, "card");
  // The keyboard has the menu's own entry for it.
  gtk_widget_set_focusable(button, FALSE);
  gtk_actionable_set_action_name(GTK_ACTIONABLE(button), action);
  gtk_actionable_set_action_target(GTK_ACTIONABLE(button), "i", target);
  g_signal_connect(button, "clicked", G_CALLBACK(+[](GtkWidget* pressed, gpointer) {
                     gtk_popover_popdown(GTK_POPOVER(gtk_widget_get_ancestor(pressed, GTK_TYPE_POPOVER)));
                   }),
                   nullptr);
  const std::string name = takeString(g_filename_display_basename(path.c_str()));
  gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, name.c_str(), -1);
  // The popover is placed by its first size, so what comes later lies over a place that is kept for it.
  GtkWidget* overlay = gtk_overlay_new();
  GtkWidget* place = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  gtk_widget_set_size_request(place, PeekWidth, PeekHeight);
  gtk_overlay_set_child(GTK_OVERLAY(overlay), place);
  gtk_widget_set_overflow(overlay, GTK_OVERFLOW_HIDDEN);
  gtk_button_set_child(GTK_BUTTON(button), overlay);
  g_object_set_data_full(G_OBJECT(button), "vaelo-peek", new ItemPeek(overlay, path),
                         [](gpointer peek) { delete static_cast<ItemPeek*>(peek); });
  return button;
}

}  // namespace vaelo
