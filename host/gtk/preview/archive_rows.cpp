// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/archive_rows.h"

#include <algorithm>

#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

using Listing = std::shared_ptr<const ArchiveListing>;

struct RowObject {
  GObject parent;
  Listing* listing;
  std::uint32_t index;
};

void finalizeRow(GObject* object) {
  delete reinterpret_cast<RowObject*>(object)->listing;
  static_cast<GObjectClass*>(g_type_class_peek(G_TYPE_OBJECT))->finalize(object);
}

GType rowType() {
  static const GType type = g_type_register_static_simple(
      G_TYPE_OBJECT, "VaeloArchiveRow", sizeof(GObjectClass),
      [](gpointer rowClass, gpointer) { G_OBJECT_CLASS(rowClass)->finalize = finalizeRow; }, sizeof(RowObject), nullptr,
      G_TYPE_FLAG_NONE);
  return type;
}

const ArchiveListing::Entry& entryOf(gpointer object) {
  const auto* row = static_cast<RowObject*>(object);
  return (*row->listing)->entry(row->index);
}

gpointer makeRow(GType type, const Listing& listing, std::uint32_t index) {
  auto* row = static_cast<RowObject*>(g_object_new(type, nullptr));
  row->listing = new Listing(listing);
  row->index = index;
  return row;
}

// Of a folder of many entries only the rows that are seen are made, so that opening it is quick.
void initModel(gpointer interface, gpointer) {
  auto* model = static_cast<GListModelInterface*>(interface);
  model->get_item_type = [](GListModel*) { return rowType(); };
  model->get_n_items = [](GListModel* folder) { return static_cast<guint>(entryOf(folder).inside.size()); };
  model->get_item = [](GListModel* folder, guint place) -> gpointer {
    const std::vector<std::uint32_t>& inside = entryOf(folder).inside;
    const Listing& listing = *reinterpret_cast<RowObject*>(folder)->listing;
    return place < inside.size() ? makeRow(rowType(), listing, inside[place]) : nullptr;
  };
}

// A row as well, that of the folder.
GType modelType() {
  static const GType type = [] {
    const GType made = g_type_register_static_simple(rowType(), "VaeloArchiveFolder", sizeof(GObjectClass), nullptr,
                                                     sizeof(RowObject), nullptr, G_TYPE_FLAG_NONE);
    const GInterfaceInfo interface = {initModel, nullptr, nullptr};
    g_type_add_interface_static(made, G_TYPE_LIST_MODEL, &interface);
    return made;
  }();
  return type;
}

GListModel* rowsIn(const Listing& listing, std::uint32_t folder) {
  return G_LIST_MODEL(makeRow(modelType(), listing, folder));
}

GListModel* rowsInside(gpointer object, gpointer) {
  const auto* row = static_cast<RowObject*>(object);
  const ArchiveListing::Entry& entry = entryOf(object);
  return entry.isFolder && !entry.inside.empty() ? rowsIn(*row->listing, row->index) : nullptr;
}

std::string detailsOf(const ArchiveListing::Entry& entry) {
  Formatting& formatting = Platform::current().formatting;
  if (entry.isFolder) {
    const auto count = static_cast<std::int64_t>(entry.inside.size());
    return formatting.localizedCount(".DICT.ITEMS.%d", count);
  }
  std::string details = entry.size ? formatting.byteCount(*entry.size, ByteCountStyle::File) : "";
  if (entry.modified) {
    const Date date = Date(std::chrono::seconds(*entry.modified));
    details += (details.empty() ? "" : " · ") + formatting.localizedDate(date, DateStyle::Medium, DateStyle::Short);
  }
  return details;
}

GIcon* iconOf(const ArchiveListing::Entry& entry) {
  if (entry.isFolder) return g_themed_icon_new("folder");
  const std::string type = takeString(g_content_type_guess(entry.name.c_str(), nullptr, 0, nullptr));
  return g_content_type_get_icon(type.c_str());
}

GtkWidget* makeLabel(PangoEllipsizeMode ellipsize) {
  GtkWidget* label = gtk_label_new(nullptr);
  gtk_label_set_xalign(GTK_LABEL(label), 0);
  gtk_label_set_ellipsize(GTK_LABEL(label), ellipsize);
  return label;
}

struct RowWidgets {
  GtkWidget* expander;
  GtkWidget* icon;
  GtkWidget* name;
  GtkWidget* details;
  GtkWidget* lock;
};

RowWidgets& widgetsOf(GtkListItem* item) {
  return *static_cast<RowWidgets*>(g_object_get_data(G_OBJECT(item), "vaelo-row"));
}

void setUp(GtkSignalListItemFactory*, GtkListItem* item, gpointer) {
  auto* row = new RowWidgets{gtk_tree_expander_new(), gtk_image_new(), makeLabel(PANGO_ELLIPSIZE_MIDDLE),
                             makeLabel(PANGO_ELLIPSIZE_END), gtk_image_new_from_icon_name("channel-secure-symbolic")};
  gtk_image_set_pixel_size(GTK_IMAGE(row->icon), 32);
  for (const char* style : {"caption", "dim-label", "numeric"}) gtk_widget_add_css_class(row->details, style);
  GtkWidget* lines = gtk_box_new(GTK_ORIENTATION_VERTICAL, 1);
  gtk_widget_set_hexpand(lines, TRUE);
  gtk_widget_set_valign(lines, GTK_ALIGN_CENTER);
  gtk_box_append(GTK_BOX(lines), row->name);
  gtk_box_append(GTK_BOX(lines), row->details);
  gtk_widget_add_css_class(row->lock, "dim-label");
  gtk_widget_set_tooltip_text(row->lock, _("Protected by a password"));
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 12);
  gtk_widget_set_size_request(box, -1, 48);
  gtk_widget_set_margin_end(box, 6);
  for (GtkWidget* child : {row->icon, lines, row->lock}) gtk_box_append(GTK_BOX(box), child);
  gtk_tree_expander_set_child(GTK_TREE_EXPANDER(row->expander), box);
  gtk_list_item_set_child(item, row->expander);
  g_object_set_data_full(G_OBJECT(item), "vaelo-row", row, [](gpointer data) { delete static_cast<RowWidgets*>(data); });
}

void bind(GtkSignalListItemFactory*, GtkListItem* item, gpointer) {
  const RowWidgets& row = widgetsOf(item);
  auto* place = GTK_TREE_LIST_ROW(gtk_list_item_get_item(item));
  const GRef<GObject> object(G_OBJECT(gtk_tree_list_row_get_item(place)));
  const ArchiveListing::Entry& entry = entryOf(object.get());
  gtk_tree_expander_set_list_row(GTK_TREE_EXPANDER(row.expander), place);
  const GRef<GIcon> icon(iconOf(entry));
  gtk_image_set_from_gicon(GTK_IMAGE(row.icon), icon.get());
  const std::string details = detailsOf(entry);
  gtk_label_set_text(GTK_LABEL(row.name), entry.name.c_str());
  gtk_label_set_text(GTK_LABEL(row.details), details.c_str());
  gtk_widget_set_visible(row.details, !details.empty());
  gtk_widget_set_visible(row.lock, entry.isLocked);
  // A name that doesn't fit is told by its tooltip.
  gtk_widget_set_tooltip_text(row.name, entry.name.c_str());
  const std::string label = details.empty() ? entry.name : listedText(entry.name, details);
  GtkWidget* listRow = gtk_widget_get_parent(row.expander);
  gtk_accessible_update_property(GTK_ACCESSIBLE(listRow), GTK_ACCESSIBLE_PROPERTY_LABEL, label.c_str(), -1);
}

void unbind(GtkSignalListItemFactory*, GtkListItem* item, gpointer) {
  gtk_tree_expander_set_list_row(GTK_TREE_EXPANDER(widgetsOf(item).expander), nullptr);
}

constexpr guint MostRemembered = 2000;  // rows, each of which is made for it

GRef<GtkTreeListRow> rowAt(GtkTreeListModel* rows, guint place) {
  return GRef<GtkTreeListRow>(gtk_tree_list_model_get_row(rows, place));
}

std::string pathOf(GtkTreeListRow* row) {
  const GRef<GtkTreeListRow> above(gtk_tree_list_row_get_parent(row));
  const GRef<GObject> object(G_OBJECT(gtk_tree_list_row_get_item(row)));
  return (above ? pathOf(above.get()) : "") + "/" + entryOf(object.get()).name;
}

}  // namespace

std::set<std::string> openArchiveFolders(GtkTreeListModel* rows) {
  std::set<std::string> paths;
  const guint count = std::min(g_list_model_get_n_items(G_LIST_MODEL(rows)), MostRemembered);
  for (guint place = 0; place < count; ++place) {
    const GRef<GtkTreeListRow> row = rowAt(rows, place);
    if (gtk_tree_list_row_get_expanded(row.get())) paths.insert(pathOf(row.get()));
  }
  return paths;
}

void openArchiveFolders(GtkTreeListModel* rows, const std::set<std::string>& paths) {
  for (guint place = 0; place < std::min(g_list_model_get_n_items(G_LIST_MODEL(rows)), MostRemembered); ++place) {
    const GRef<GtkTreeListRow> row = rowAt(rows, place);
    if (paths.contains(pathOf(row.get()))) gtk_tree_list_row_set_expanded(row.get(), TRUE);
  }
}

GtkTreeListModel* makeArchiveRows(std::shared_ptr<const ArchiveListing> listing) {
  GListModel* top = rowsIn(listing, 0);
  return gtk_tree_list_model_new(top, FALSE, FALSE, rowsInside, nullptr, nullptr);
}

GtkListItemFactory* makeArchiveRowFactory() {
  GtkListItemFactory* factory = gtk_signal_list_item_factory_new();
  g_signal_connect(factory, "setup", G_CALLBACK(setUp), nullptr);
  g_signal_connect(factory, "bind", G_CALLBACK(bind), nullptr);
  g_signal_connect(factory, "unbind", G_CALLBACK(unbind), nullptr);
  return factory;
}

}  // namespace vaelo
