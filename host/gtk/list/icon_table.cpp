// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/list/icon_table.h"

#include <strings.h>

#include <algorithm>
#include <utility>

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
  g_object_ref(widget);
  worker_.run([this, kind, key, size, scale, widget]() -> std::function<void()> {
    GIcon* icon = iconOfKey(kind);
    return [this, key, icon, size, scale, widget] {
      found(key, icon, size, scale, widget);
      g_object_unref(icon);
      g_object_unref(widget);
    };
  });
  return nullptr;
}

void IconTable::found(const std::string& key, GIcon* icon, int size, int scale, GtkWidget* widget) {
  GtkIconPaintable* paintable = gtk_icon_theme_lookup_by_gicon(theme_, icon, size, scale, gtk_widget_get_direction(widget),
                                                               static_cast<GtkIconLookupFlags>(0));
  GFile* file = gtk_icon_paintable_get_file(paintable);
  if (!file || gtk_icon_paintable_is_symbolic(paintable)) {
    g_clear_object(&file);
    icons_[key] = GDK_PAINTABLE(paintable);
    changed_();
    return;
  }
  worker_.run([this, key, file, paintable, pixels = size * scale]() -> std::function<void()> {
    GdkTexture* texture = decode(file, pixels);
    return [this, key, file, paintable, texture] {
      GdkPaintable*& place = icons_[key];
      g_clear_object(&place);
      place = texture ? GDK_PAINTABLE(texture) : GDK_PAINTABLE(g_object_ref(paintable));
      g_object_unref(file);
      g_object_unref(paintable);
      changed_();
    };
  });
}

}  // namespace vaelo
