// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/tags_popover.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "host/drive/drive_synced_store.h"
#include "host/drive/item_attributes.h"
#include "host/drive/promise_file.h"
#include "host/drive/small_file.h"
#include "host/gtk/focus_return.h"
#include "host/gtk/list/worker.h"
#include "host/gtk/popover_parent.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "items/dr_item.h"
#include "items/file_tags.h"

namespace vaelo {

namespace {

/// More than anybody looks through; the field finds the others by their name.
constexpr std::size_t MostRows = 200;
constexpr int RowHeight = 44;
constexpr std::array<const char*, 8> ColorNames = {N_("No color"), N_("Gray"),   N_("Green"), N_("Purple"),
                                                   N_("Blue"),     N_("Yellow"), N_("Red"),   N_("Orange")};

std::string dotOf(const Color& color) {
  const auto byte = [](double channel) { return static_cast<int>(std::lround(std::clamp(channel, 0.0, 1.0) * 255)); };
  return takeString(
      g_strdup_printf("<span foreground=\"#%02x%02x%02x\">●</span>", byte(color.red), byte(color.green), byte(color.blue)));
}

/// Takes as much room as a dot: the names of all tags begin at one place.
constexpr const char* NoDot = "<span fgalpha=\"1\">●</span>";

/// On one line, whatever another program has put into a name.
std::string shown(std::string name) {
  std::replace_if(
      name.begin(), name.end(), [](unsigned char c) { return c < 0x20 || c == 0x7f; }, ' ');
  return name;
}

void setAccessibleName(GtkWidget* widget, const std::string& name) {
  gtk_accessible_update_property(GTK_ACCESSIBLE(widget), GTK_ACCESSIBLE_PROPERTY_LABEL, name.c_str(), -1);
}

std::optional<Error> setTag(const std::string& path, const std::string& name, bool on) {
  const std::optional<std::string> physical = physicalPathOf(path);
  if (!physical) return fileError(FileErrorCode::NoSuchFile, path, _("The item is no longer there."));
  return setTagAt(*physical, name, on);
}

std::string messageFor(const Error& error) {
  switch (error.code) {
    case FileErrorCode::WriteInvalidFileName:
      return _("A tag’s name is text without commas, at most 100 letters.");
    case FileErrorCode::NoSuchFile:
      return _("The item is no longer there.");
    case FileErrorCode::WriteNoPermission:
      return _("You have no permission to change this item.");
    case FileErrorCode::FeatureUnsupported:
      return _("A newer version of the application keeps the tags.");
    default:
      return filled(_("The tags can’t be changed: %s"), {translated(error.localizedFailureReason.value_or(""))});
  }
}

/// Lives as long as its popover.
class TagsPopover {
 public:
  TagsPopover(GtkWidget* over, const GdkRectangle& at, const URL& item, DriveSyncedStore& tags,
              std::function<void()> changed)
      : path_(item.path()), tags_(tags), changed_(std::move(changed)), popover_(gtk_popover_new()) {
    setPopoverParent(popover_, over);
    gtk_popover_set_pointing_to(GTK_POPOVER(popover_), &at);
    setAccessibleName(popover_, _("Tags"));
    GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 6);
    rows_ = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
    GtkWidget* scroller = gtk_scrolled_window_new();
    gtk_scrolled_window_set_policy(GTK_SCROLLED_WINDOW(scroller), GTK_POLICY_NEVER, GTK_POLICY_AUTOMATIC);
    gtk_scrolled_window_set_propagate_natural_height(GTK_SCROLLED_WINDOW(scroller), TRUE);
    gtk_scrolled_window_set_max_content_height(GTK_SCROLLED_WINDOW(scroller), 6 * RowHeight);
    gtk_scrolled_window_set_child(GTK_SCROLLED_WINDOW(scroller), rows_);
    gtk_widget_set_visible(scroller, FALSE);  // while there are no rows
    gtk_box_append(GTK_BOX(box), scroller);
    makeField(box);
    gtk_popover_set_child(GTK_POPOVER(popover_), box);
    keepFocusIn(box);
    g_signal_connect(popover_, "destroy", G_CALLBACK(+[](GtkWidget*, TagsPopover* self) { delete self; }), this);
    worker_.run([this, path = path_]() -> std::function<void()> {
      const std::optional<std::string> physical = physicalPathOf(path);
      return [this, names = physical ? tagNamesAt(*physical) : std::vector<std::string>()] { fill(names); };
    });
  }

 private:
  /// The parent does not know of the popover when it moves the focus, so that Tab would leave it.
  void keepFocusIn(GtkWidget* box) {
    GtkEventController* keys = gtk_event_controller_key_new();
    gtk_event_controller_set_propagation_phase(keys, GTK_PHASE_CAPTURE);
    g_signal_connect(
        keys, "key-pressed",
        G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType, GtkWidget* inside) -> gboolean {
          if (key != GDK_KEY_Tab && key != GDK_KEY_ISO_Left_Tab) return FALSE;
          const GtkDirectionType way = key == GDK_KEY_Tab ? GTK_DIR_TAB_FORWARD : GTK_DIR_TAB_BACKWARD;
          if (gtk_widget_child_focus(inside, way)) return TRUE;
          gtk_root_set_focus(gtk_widget_get_root(inside), nullptr);
          gtk_widget_child_focus(inside, way);
          return TRUE;
        }),
        box);
    gtk_widget_add_controller(popover_, keys);
  }

  void makeField(GtkWidget* box) {
    field_ = gtk_entry_new();
    gtk_entry_set_placeholder_text(GTK_ENTRY(field_), _("New tag"));
    setAccessibleName(field_, _("New tag"));
    gtk_box_append(GTK_BOX(box), field_);
    g_signal_connect_swapped(field_, "activate", G_CALLBACK(+[](TagsPopover* self) { self->addTyped(); }), this);
    GtkWidget* palette = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 0);
    gtk_widget_set_halign(palette, GTK_ALIGN_CENTER);
    for (std::size_t i = 0; i < ColorNames.size(); ++i) {
      GtkWidget* button = gtk_toggle_button_new();
      GtkWidget* dot = gtk_label_new(nullptr);
      gtk_label_set_markup(GTK_LABEL(dot), dotOf(FileTags::_tagBlipColors()[i]).c_str());
      gtk_button_set_child(GTK_BUTTON(button), dot);
      gtk_widget_add_css_class(button, "flat");
      gtk_widget_set_tooltip_text(button, _(ColorNames[i]));
      setAccessibleName(button, _(ColorNames[i]));
      if (i > 0) gtk_toggle_button_set_group(GTK_TOGGLE_BUTTON(button), GTK_TOGGLE_BUTTON(colors_[0]));
      colors_[i] = button;
      gtk_box_append(GTK_BOX(palette), button);
    }
    gtk_toggle_button_set_active(GTK_TOGGLE_BUTTON(colors_[0]), TRUE);
    gtk_box_append(GTK_BOX(box), palette);
    problem_ = gtk_label_new(nullptr);
    gtk_label_set_wrap(GTK_LABEL(problem_), TRUE);
    gtk_label_set_max_width_chars(GTK_LABEL(problem_), 32);
    gtk_label_set_xalign(GTK_LABEL(problem_), 0);
    gtk_widget_add_css_class(problem_, "error");
    gtk_widget_set_visible(problem_, FALSE);
    gtk_box_append(GTK_BOX(box), problem_);
  }

  void fill(const std::vector<std::string>& names) {
    const std::set<std::string> on(names.begin(), names.end());
    palette_ = FileTags::tagColorsByTag();
    // Those that it has come first: of ten thousand they may not be among the first.
    for (const std::string& name : names) addRow(name, true);
    for (const std::string& name : FileTags::allTags()) {
      if (checks_.size() >= MostRows) break;
      if (!on.contains(name) && isTagName(name)) addRow(name, false);
    }
    returnFocusWhenClosed(popover_);
    gtk_popover_popup(GTK_POPOVER(popover_));
  }

  void addRow(const std::string& name, bool on) {
    if (checks_.contains(name)) return;
    const auto color = palette_.find(name);
    // Beside each other, and not in one text, which would begin with the name's last letters where that is written from the
    // other side.
    GtkWidget* line = gtk_box_new(GTK_ORIENTATION_HORIZONTAL, 4);
    GtkWidget* dot = gtk_label_new(nullptr);
    // One that is not among the user's tags has no dot in the details either.
    gtk_label_set_markup(GTK_LABEL(dot), color == palette_.end() ? NoDot : dotOf(color->second).c_str());
    gtk_box_append(GTK_BOX(line), dot);
    GtkWidget* text = gtk_label_new(shown(name).c_str());
    gtk_label_set_ellipsize(GTK_LABEL(text), PANGO_ELLIPSIZE_END);
    gtk_label_set_max_width_chars(GTK_LABEL(text), 26);
    gtk_label_set_xalign(GTK_LABEL(text), 0);
    gtk_box_append(GTK_BOX(line), text);
    GtkWidget* check = gtk_check_button_new();
    gtk_check_button_set_child(GTK_CHECK_BUTTON(check), line);
    gtk_check_button_set_active(GTK_CHECK_BUTTON(check), on);
    gtk_widget_set_size_request(check, -1, RowHeight);
    setAccessibleName(check, shown(name));
    g_object_set_data_full(G_OBJECT(check), "vaelo-tag", g_strdup(name.c_str()), g_free);
    g_signal_connect(check, "toggled", G_CALLBACK(+[](GtkCheckButton* toggled, TagsPopover* self) {
                       const auto* tag = static_cast<const char*>(g_object_get_data(G_OBJECT(toggled), "vaelo-tag"));
                       self->toggled(tag, gtk_check_button_get_active(toggled));
                     }),
                     this);
    checks_[name] = check;
    gtk_box_append(GTK_BOX(rows_), check);
    gtk_widget_set_visible(gtk_widget_get_ancestor(rows_, GTK_TYPE_SCROLLED_WINDOW), TRUE);
  }

  void toggled(const std::string& name, bool on) {
    if (settling_) return;
    gtk_widget_set_visible(problem_, FALSE);
    worker_.run([this, path = path_, name, on]() -> std::function<void()> {
      return [this, name, on, failed = setTag(path, name, on)] {
        if (failed) return refuse(name, !on, *failed);
        if (changed_) changed_();
      };
    });
  }

  void refuse(const std::string& name, bool was, const Error& error) {
    settling_ = true;
    if (const auto check = checks_.find(name); check != checks_.end()) {
      gtk_check_button_set_active(GTK_CHECK_BUTTON(check->second), was);
    }
    settling_ = false;
    gtk_label_set_text(GTK_LABEL(problem_), messageFor(error).c_str());
    gtk_widget_set_visible(problem_, TRUE);
  }

  unsigned chosenLabel() const {
    for (std::size_t i = 0; i < colors_.size(); ++i) {
      if (gtk_toggle_button_get_active(GTK_TOGGLE_BUTTON(colors_[i]))) return static_cast<unsigned>(i);
    }
    return 0;
  }

  void addTyped() {
    const std::string name = takeString(g_strstrip(g_strdup(gtk_editable_get_text(GTK_EDITABLE(field_)))));
    if (name.empty()) return;
    gtk_widget_set_visible(problem_, FALSE);
    worker_.run([this, path = path_, name, label = chosenLabel(), tags = &tags_]() -> std::function<void()> {
      std::optional<Error> failed = tags->addTag(name, label);
      if (!failed) failed = setTag(path, name, true);
      return [this, name, failed] { added(name, failed); };
    });
  }

  void added(const std::string& name, const std::optional<Error>& failed) {
    if (failed) return refuse(name, false, *failed);
    gtk_editable_set_text(GTK_EDITABLE(field_), "");
    FileTags::_tagColorsDidChange();
    palette_ = FileTags::tagColorsByTag();
    addRow(name, true);
    GtkWidget* check = checks_.at(name);
    settling_ = true;
    gtk_check_button_set_active(GTK_CHECK_BUTTON(check), TRUE);
    settling_ = false;
    showFirst(check);
    if (changed_) changed_();
  }

  /// Below all others nobody would see what became of what was typed.
  void showFirst(GtkWidget* check) {
    gtk_box_reorder_child_after(GTK_BOX(rows_), check, nullptr);
    GtkWidget* scroller = gtk_widget_get_ancestor(rows_, GTK_TYPE_SCROLLED_WINDOW);
    gtk_adjustment_set_value(gtk_scrolled_window_get_vadjustment(GTK_SCROLLED_WINDOW(scroller)), 0);
    gtk_popover_present(GTK_POPOVER(popover_));
  }

  const std::string path_;
  DriveSyncedStore& tags_;
  const std::function<void()> changed_;
  GtkWidget* popover_;
  GtkWidget* rows_ = nullptr;
  GtkWidget* field_ = nullptr;
  GtkWidget* problem_ = nullptr;
  std::array<GtkWidget*, 8> colors_{};
  std::map<std::string, Color> palette_;  // of the user's tags; a copy, since there may be thousands
  std::map<std::string, GtkWidget*> checks_;
  bool settling_ = false;
  Worker worker_;
};

}  // namespace

void showTagsPopover(GtkWidget* over, const GdkRectangle& at, const URL& item, DriveSyncedStore& tags,
                     std::function<void()> changed) {
  // Where the details of a link or bookmark have their tags from. Links themselves can't have any.
  const std::shared_ptr<DRItem> record = DRItem::initWithURL(item);
  const URL tagged = record ? record->resolvedURL().value_or(item) : item;
  new TagsPopover(over, at, tagged, tags, std::move(changed));
}

}  // namespace vaelo
