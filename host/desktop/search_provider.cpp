// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/search_provider.h"

#include <charconv>
#include <utility>

#include "host/desktop/content_type.h"
#include "host/desktop/name_search.h"
#include "host/drive/promise_file.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr std::size_t MostResults = 20;
constexpr std::size_t LongestQuery = 1000;  // bytes
constexpr std::chrono::milliseconds Budget(300);

constexpr const char* Interface = R"(<node><interface name="org.gnome.Shell.SearchProvider2">
  <method name="GetInitialResultSet"><arg type="as" name="terms" direction="in"/>
    <arg type="as" name="results" direction="out"/></method>
  <method name="GetSubsearchResultSet"><arg type="as" name="previous_results" direction="in"/>
    <arg type="as" name="terms" direction="in"/><arg type="as" name="results" direction="out"/></method>
  <method name="GetResultMetas"><arg type="as" name="identifiers" direction="in"/>
    <arg type="aa{sv}" name="metas" direction="out"/></method>
  <method name="ActivateResult"><arg type="s" name="identifier" direction="in"/>
    <arg type="as" name="terms" direction="in"/><arg type="u" name="timestamp" direction="in"/></method>
  <method name="LaunchSearch"><arg type="as" name="terms" direction="in"/>
    <arg type="u" name="timestamp" direction="in"/></method>
</interface></node>)";

std::vector<std::string> stringsAt(GVariant* arguments, gsize index) {
  GVariant* array = g_variant_get_child_value(arguments, index);
  std::vector<std::string> strings;
  for (gsize i = 0; i < g_variant_n_children(array); ++i) {
    GVariant* item = g_variant_get_child_value(array, i);
    strings.emplace_back(g_variant_get_string(item, nullptr));
    g_variant_unref(item);
  }
  g_variant_unref(array);
  return strings;
}

std::uint32_t numberAt(GVariant* arguments, gsize index) {
  GVariant* item = g_variant_get_child_value(arguments, index);
  const std::uint32_t number = g_variant_get_uint32(item);
  g_variant_unref(item);
  return number;
}

std::string joined(const std::vector<std::string>& terms) {
  std::string query;
  for (const std::string& term : terms) query += (query.empty() ? "" : " ") + term;
  if (query.size() <= LongestQuery) return query;
  query.resize(LongestQuery);
  return takeString(g_utf8_make_valid(query.c_str(), -1));
}

std::vector<SearchRoot> rootsOf(CloudDocuments& drive) {
  std::vector<SearchRoot> roots;
  const std::string own = drive.defaultContainerIdentifier();
  for (const CloudContainerRef& container : drive.allContainers()) {
    const std::optional<URL> folder = container->documentsFolderURL();
    if (!folder) continue;
    roots.push_back({folder->path(), container->identifier() == own ? "" : container->localizedName()});
  }
  return roots;
}

/// Where the item is, in words: its container and the folders down to it.
std::string placeOf(CloudDocuments& drive, const URL& item) {
  const Result<CloudContainerRef> container = drive.containerForURL(item);
  const std::optional<URL> top = container.value ? (*container.value)->documentsFolderURL() : std::nullopt;
  if (!top || *top == item) return "";
  std::string place = (*container.value)->localizedName();
  const std::vector<std::string> parts = item.pathComponents();
  for (std::size_t i = top->pathComponents().size(); i + 1 < parts.size(); ++i) {
    place += " › " + takeString(g_filename_display_name(parts[i].c_str()));
  }
  return place;
}

std::string nameOf(CloudDocuments& drive, const URL& item) {
  if (drive.isDocumentsContainer(item)) {
    const Result<CloudContainerRef> container = drive.containerForURL(item);
    if (container.value) return (*container.value)->localizedName();
  }
  return takeString(g_filename_display_basename(item.path().c_str()));
}

/// The item with that identifier; nothing for one that is no number, is unknown, or whose item is thrown away.
std::optional<URL> itemWithID(LocalCloudDocuments& drive, const std::string& text) {
  std::int64_t id = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), id);
  if (failure != std::errc() || end != text.data() + text.size() || id <= 0) return std::nullopt;
  const Result<IndexedDocument> document = drive.index().resolve(id);
  if (!document.value) return std::nullopt;
  const URL item = drive.logicalURLOfPromise(URL(document.value->path));
  if (!drive.URLIsInDriveMirror(item) || drive.URLIsInDriveTrash(item)) return std::nullopt;
  return item;
}

/// What the shell shows; the item is looked at, never opened, except for the first bytes of one whose name says nothing.
GVariant* metaOf(CloudDocuments& drive, const std::string& id, const URL& item) {
  const GRef<GIcon> icon(g_content_type_get_icon(contentTypeOf(item.path()).c_str()));
  GVariantBuilder meta;
  g_variant_builder_init(&meta, G_VARIANT_TYPE_VARDICT);
  g_variant_builder_add(&meta, "{sv}", "id", g_variant_new_string(id.c_str()));
  g_variant_builder_add(&meta, "{sv}", "name", g_variant_new_string(nameOf(drive, item).c_str()));
  g_variant_builder_add(&meta, "{sv}", "description", g_variant_new_string(placeOf(drive, item).c_str()));
  g_variant_builder_add(&meta, "{sv}", "gicon", g_variant_new_take_string(g_icon_to_string(icon.get())));
  return g_variant_builder_end(&meta);
}

/// Keeps the application from ending for want of windows while a call is under way. Made and let go on the main thread.
class Hold {
 public:
  Hold() : application_(g_application_get_default()) {
    if (application_) g_application_hold(application_);
  }
  ~Hold() {
    if (application_) g_application_release(application_);
  }
  Hold(const Hold&) = delete;
  Hold& operator=(const Hold&) = delete;

 private:
  GApplication* application_;
};

}  // namespace

SearchProvider::SearchProvider(LocalCloudDocuments& drive, Events events) : drive_(drive), events_(std::move(events)) {}

SearchProvider::~SearchProvider() {
  unexport();
  const std::lock_guard lock(gate_->mutex);
  gate_->closed = true;
}

bool SearchProvider::exportOn(GDBusConnection* bus, const std::string& objectPath, GError** error) {
  GDBusNodeInfo* node = g_dbus_node_info_new_for_xml(Interface, nullptr);
  static const GDBusInterfaceVTable calls{[](GDBusConnection*, const char*, const char*, const char*, const char* method,
                                             GVariant* arguments, GDBusMethodInvocation* call, gpointer self) {
                                            static_cast<SearchProvider*>(self)->called(method, arguments, call);
                                          },
                                          nullptr,
                                          nullptr,
                                          {}};
  registration_ =
      g_dbus_connection_register_object(bus, objectPath.c_str(), node->interfaces[0], &calls, this, nullptr, error);
  g_dbus_node_info_unref(node);
  if (!registration_) return false;
  bus_ = G_DBUS_CONNECTION(g_object_ref(bus));
  return true;
}

void SearchProvider::unexport() {
  if (searching_) *searching_ = true;
  if (!bus_) return;
  g_dbus_connection_unregister_object(bus_, std::exchange(registration_, 0));
  g_object_unref(std::exchange(bus_, nullptr));
}

void SearchProvider::called(const std::string& method, GVariant* arguments, GDBusMethodInvocation* call) {
  if (method == "GetInitialResultSet") return search(stringsAt(arguments, 0), call);
  // The earlier results may stem from a search that ended early, so they are no place to look for the new ones.
  if (method == "GetSubsearchResultSet") return search(stringsAt(arguments, 1), call);
  if (method == "GetResultMetas") return describe(stringsAt(arguments, 0), call);
  g_dbus_method_invocation_return_value(call, nullptr);
  if (method == "ActivateResult") {
    GVariant* id = g_variant_get_child_value(arguments, 0);
    choose(g_variant_get_string(id, nullptr), numberAt(arguments, 2));
    g_variant_unref(id);
  } else {
    events_.continued(joined(stringsAt(arguments, 0)), numberAt(arguments, 1));
  }
}

void SearchProvider::choose(const std::string& id, std::uint32_t timestamp) {
  // The application asks for the item on the main thread, where nobody should wait for a walk of the whole mirror.
  worker_.run([this, &drive = drive_, gate = gate_, id, timestamp,
               hold = std::make_shared<Hold>()]() mutable -> std::function<void()> {
    const std::lock_guard lock(gate->mutex);
    if (gate->closed) return nullptr;
    itemWithID(drive, id);
    return [this, gate, id, timestamp, hold = std::move(hold)] {
      if (!gate->closed) events_.chosen(id, timestamp);
    };
  });
}

void SearchProvider::search(const std::vector<std::string>& terms, GDBusMethodInvocation* call) {
  if (searching_) *searching_ = true;
  searching_ = std::make_shared<std::atomic<bool>>(false);
  worker_.run([&drive = drive_, gate = gate_, terms, call, stopped = searching_,
               hold = std::make_shared<Hold>()]() mutable -> std::function<void()> {
    const std::lock_guard lock(gate->mutex);
    if (gate->closed) return nullptr;
    std::vector<std::string> ids;
    for (const SearchHit& hit : NameSearch(terms).run(rootsOf(drive), MostResults, Budget, *stopped)) {
      const Result<std::int64_t> id = drive.index().documentIDFor(hit.path, true);
      if (id.value && *id.value > 0) ids.push_back(std::to_string(*id.value));
    }
    return [ids, call, hold = std::move(hold)] {
      GVariantBuilder results;
      g_variant_builder_init(&results, G_VARIANT_TYPE_STRING_ARRAY);
      for (const std::string& id : ids) g_variant_builder_add(&results, "s", id.c_str());
      g_dbus_method_invocation_return_value(call, g_variant_new("(as)", &results));
    };
  });
}

void SearchProvider::describe(const std::vector<std::string>& ids, GDBusMethodInvocation* call) {
  worker_.run(
      [&drive = drive_, gate = gate_, ids, call, hold = std::make_shared<Hold>()]() mutable -> std::function<void()> {
        const std::lock_guard lock(gate->mutex);
        if (gate->closed) return nullptr;
        GVariantBuilder metas;
        g_variant_builder_init(&metas, G_VARIANT_TYPE("aa{sv}"));
        for (std::size_t i = 0; i < std::min(ids.size(), MostResults); ++i) {
          const std::optional<URL> item = itemWithID(drive, ids[i]);
          if (item) g_variant_builder_add_value(&metas, metaOf(drive, ids[i], *item));
        }
        GVariant* answer = g_variant_ref_sink(g_variant_new("(aa{sv})", &metas));
        return [answer, call, hold = std::move(hold)] {
          g_dbus_method_invocation_return_value(call, answer);
          g_variant_unref(answer);
        };
      });
}

}  // namespace vaelo
