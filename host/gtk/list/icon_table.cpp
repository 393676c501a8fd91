// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/icon_table.h"

#include <algorithm>
#include <memory>
#include <utility>

#include "host/support/glib_ptr.h"

namespace vaelo {
namespace {

/// What all entries with the same icon have in common: an icon's name, or a dot and the extension.
std::string iconKey(const FolderItem& item) {
  if (!item.icon.empty()) return item.icon;
  switch (item.kind) {
    case EntryKind::Folder:
    case EntryKind::FolderLink:
      return "folder";
    case EntryKind::Package:
    case EntryKind::PromisedPackage:
      return "package-x-generic";
    default:
      break;
  }
  std::string_view name = item.name;
  constexpr std::string_view bookmark = ".vaelobookmark";
  // A bookmark looks like the document it leads to.
  if (item.kind == EntryKind::Bookmark) name.remove_suffix(bookmark.size());
  const std::size_t dot = name.rfind('.');
  // Longer ones are hardly types, and would fill the table.
  if (dot == std::string_view::npos || dot == 0 || name.size() - dot > 12) return ".";
  std::string key(name.substr(dot));
  std::transform(key.begin(), key.end(), key.begin(), [](char c) { return g_ascii_tolower(c); });
  return key;
}

GIcon* iconOfKey(const std::string& key) {
  if (key.front() != '.') return g_themed_icon_new(key.c_str());
  char* type = key == "." ? nullptr : g_content_type_guess(("name" + key).c_str(), nullptr, 0, nullptr);
  GIcon* icon = type ? g_content_type_get_icon(type) : g_themed_icon_new("text-x-generic");
  g_free(type);
  return icon;
}

GdkTexture* decode(GFile* file, int pixels) {
  GFileInputStream* stream = g_file_read(file, nullptr, nullptr);
  if (!stream) return nullptr;
  GdkPixbuf* picture = gdk_pixbuf_new_from_stream_at_scale(G_INPUT_STREAM(stream), pixels, pixels, TRUE, nullptr, nullptr);
  g_object_unref(stream);
  if (!picture) return nullptr;
  GdkTexture* texture = gdk_texture_new_for_pixbuf(picture);
  g_object_unref(picture);
  return texture;
}

/// A reference that jobs carry along, wherever they are dropped.
template <typename T>
std::shared_ptr<T> shared(T* object) {
  return std::shared_ptr<T>(object, GObjectUnref());
}

}  // namespace

IconTable::IconTable(std::function<void()> changed) : changed_(std::move(changed)) {}

IconTable::~IconTable() {
  if (theme_) g_signal_handler_disconnect(theme_, themeChanged_);
  clear();
}

void IconTable::clear() {
  for (auto& [key, icon] : icons_) g_clear_object(&icon);
  icons_.clear();
}

GdkPaintable* IconTable::iconFor(const FolderItem& item, int size, GtkWidget* widget) {
  if (!theme_) {
    theme_ = gtk_icon_theme_get_for_display(gtk_widget_get_display(widget));
    themeChanged_ = g_signal_connect_swapped(theme_, "changed", G_CALLBACK(+[](IconTable* self) {
                                               self->clear();
                                               self->changed_();
                                             }),
                                             this);
  }
  const std::string kind = iconKey(item);
  const int scale = gtk_widget_get_scale_factor(widget);
  const std::string key = kind + '/' + std::to_string(size * scale);
  const auto [place, isNew] = icons_.try_emplace(key, nullptr);
  if (!isNew) return place->second;
  const GtkTextDirection direction = gtk_widget_get_direction(widget);
  worker_.run([this, kind, key, size, scale, direction]() -> std::function<void()> {
    return [this, key, size, scale, direction, icon = shared(iconOfKey(kind))] {
      lookUp(key, icon.get(), size, scale, direction);
    };
  });
  return nullptr;
}

void IconTable::lookUp(const std::string& key, GIcon* icon, int size, int scale, GtkTextDirection direction) {
  const auto paintable =
      shared(gtk_icon_theme_lookup_by_gicon(theme_, icon, size, scale, direction, static_cast<GtkIconLookupFlags>(0)));
  GFile* found = gtk_icon_paintable_get_file(paintable.get());
  if (!found || gtk_icon_paintable_is_symbolic(paintable.get())) {
    g_clear_object(&found);
    store(key, GDK_PAINTABLE(paintable.get()));
    return;
  }
  worker_.run([this, key, paintable, file = shared(found), pixels = size * scale]() -> std::function<void()> {
    GdkTexture* texture = decode(file.get(), pixels);
    // The toolkit decodes by itself what can't be decoded here.
    if (!texture) return [this, key, paintable] { store(key, GDK_PAINTABLE(paintable.get())); };
    return [this, key, picture = shared(texture)] { store(key, GDK_PAINTABLE(picture.get())); };
  });
}

void IconTable::store(const std::string& key, GdkPaintable* icon) {
  g_set_object(&icons_[key], icon);
  changed_();
}

}  // namespace vaelo
