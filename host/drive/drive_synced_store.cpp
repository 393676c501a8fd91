// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/drive_synced_store.h"

#include <fcntl.h>
#include <sys/file.h>

#include <cerrno>
#include <memory>

#include "host/drive/item_attributes.h"
#include "host/drive/small_file.h"
#include "host/drive/tag_dictionary.h"
#include "host/drive/variant.h"
#include "host/support/glib_ptr.h"
#include "host/support/unique_fd.h"

namespace vaelo {

namespace {

constexpr const char* FileName = "/.vaelo/values";
constexpr std::size_t LargestFile = 4 * 1024 * 1024;  // of tens of thousands of tags
/// Other programs write the file: what is nested deeper is not read.
constexpr int DeepestNesting = 8;

Value valueOf(GVariant* variant, int depth);

Dictionary dictionaryOf(GVariant* variant, int depth) {
  Dictionary dictionary;
  GVariantIter iterator;
  g_variant_iter_init(&iterator, variant);
  while (const Variant entry{g_variant_iter_next_value(&iterator)}) {
    const Variant key(g_variant_get_child_value(entry.get(), 0));
    const Variant value(g_variant_get_child_value(entry.get(), 1));
    if (g_variant_is_of_type(key.get(), G_VARIANT_TYPE_STRING)) {
      dictionary[g_variant_get_string(key.get(), nullptr)] = valueOf(value.get(), depth + 1);
    }
  }
  return dictionary;
}

Array arrayOf(GVariant* variant, int depth) {
  Array array;
  GVariantIter iterator;
  g_variant_iter_init(&iterator, variant);
  while (const Variant entry{g_variant_iter_next_value(&iterator)}) array.push_back(valueOf(entry.get(), depth + 1));
  return array;
}

Value valueOf(GVariant* variant, int depth) {
  if (depth > DeepestNesting) return {};
  switch (g_variant_classify(variant)) {
    case G_VARIANT_CLASS_BOOLEAN:
      return Value(g_variant_get_boolean(variant) != FALSE);
    case G_VARIANT_CLASS_BYTE:
      return Value(std::uint64_t{g_variant_get_byte(variant)});
    case G_VARIANT_CLASS_UINT16:
      return Value(std::uint64_t{g_variant_get_uint16(variant)});
    case G_VARIANT_CLASS_UINT32:
      return Value(std::uint64_t{g_variant_get_uint32(variant)});
    case G_VARIANT_CLASS_UINT64:
      return Value(std::uint64_t{g_variant_get_uint64(variant)});
    case G_VARIANT_CLASS_INT16:
      return Value(std::int64_t{g_variant_get_int16(variant)});
    case G_VARIANT_CLASS_INT32:
      return Value(std::int64_t{g_variant_get_int32(variant)});
    case G_VARIANT_CLASS_INT64:
      return Value(std::int64_t{g_variant_get_int64(variant)});
    case G_VARIANT_CLASS_DOUBLE:
      return Value(g_variant_get_double(variant));
    case G_VARIANT_CLASS_STRING:
      return Value(std::string(g_variant_get_string(variant, nullptr)));
    case G_VARIANT_CLASS_VARIANT: {
      const Variant held(g_variant_get_variant(variant));
      return valueOf(held.get(), depth + 1);
    }
    case G_VARIANT_CLASS_ARRAY:
      if (g_variant_is_of_type(variant, G_VARIANT_TYPE_DICTIONARY)) return dictionaryOf(variant, depth);
      return arrayOf(variant, depth);
    default:
      return {};
  }
}

}  // namespace

DriveSyncedStore::DriveSyncedStore(const DriveLayout& layout, LogSink& log, NotificationCenter& notifications)
    : layout_(layout), log_(log), notifications_(notifications) {}

DriveSyncedStore::~DriveSyncedStore() { unwatch(); }

std::string DriveSyncedStore::path() const { return layout_.mirrorRoot() + FileName; }

void DriveSyncedStore::unwatch() {
  {
    const std::lock_guard lock(mutex_);
    watched_ = current_ = false;
  }
  if (!monitor_) return;
  g_signal_handlers_disconnect_by_data(monitor_, this);
  g_file_monitor_cancel(monitor_);
  g_clear_object(&monitor_);
}

void DriveSyncedStore::accountChanged() {
  unwatch();
  watch();
  notifications_.post({SyncedStoreDidChangeExternallyNotification, {}});
}

Value DriveSyncedStore::objectForKey(const std::string& key) {
  const std::lock_guard lock(mutex_);
  if (!current_) values_ = read();
  // Without a watch every question reads the file again.
  current_ = watched_;
  const auto found = values_.find(key);
  return found == values_.end() ? Value() : found->second;
}

Dictionary DriveSyncedStore::read() {
  const Result<std::string> text = readSmallFile(path(), LargestFile);
  if (!text.value) {
    if (text.error->code != FileErrorCode::ReadNoSuchFile) {
      log_.write(LogType::Error, "drive: the synced values can't be read: " + text.error->description());
    }
    return {};
  }
  GError* problem = nullptr;
  const Variant parsed(g_variant_parse(G_VARIANT_TYPE_VARDICT, text.value->data(), text.value->data() + text.value->size(),
                                       nullptr, &problem));
  if (parsed) return dictionaryOf(parsed.get(), 0);
  const GErrorPtr owned(problem);
  log_.write(LogType::Error, "drive: the synced values of " + path() + " can't be read: " + owned->message);
  return {};
}

std::optional<Error> DriveSyncedStore::addTag(const std::string& name, unsigned label) {
  if (!isTagName(name)) return fileError(FileErrorCode::WriteInvalidFileName, path(), "no name for a tag");
  const std::string file = path();
  const std::string folder = file.substr(0, file.rfind('/'));
  if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) return errorFromErrno(errno, folder, FileAccess::Write);
  // Whoever writes holds it, so that no tag is lost to another process that adds one too.
  const UniqueFd turn(::open((folder + "/.values.lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
  while (turn && ::flock(turn.get(), LOCK_EX) != 0 && errno == EINTR) {
  }
  const Result<std::string> text = readSmallFile(file, LargestFile);
  if (text.error && text.error->code != FileErrorCode::ReadNoSuchFile) return text.error;
  Result<std::string> changed = valuesWithTag(text.value.value_or(""), name, label);
  if (changed.error && changed.error->code == FileErrorCode::ReadUnknown) {
    if (const int status = setFileAside(file)) return errorFromErrno(status, file, FileAccess::Write);
    changed = valuesWithTag("", name, label);
  }
  if (changed.error) return changed.error;
  if (text.value && *text.value == *changed.value) return std::nullopt;
  if (changed.value->size() > LargestFile) return fileError(FileErrorCode::WriteUnknown, file, "there are too many tags");
  std::optional<Error> failed = writeSmallFile(file, *changed.value);
  // Who asks now is not to wait until the file's watch has told of it.
  const std::lock_guard lock(mutex_);
  current_ = false;
  return failed;
}

void DriveSyncedStore::watch() {
  const GRef<GFile> file(g_file_new_for_path(path().c_str()));
  monitor_ = g_file_monitor_file(file.get(), G_FILE_MONITOR_NONE, nullptr, nullptr);
  if (!monitor_) return;
  g_signal_connect_swapped(monitor_, "changed",
                           G_CALLBACK(+[](DriveSyncedStore* self, GFile*, GFile*, GFileMonitorEvent event, GFileMonitor*) {
                             // A file that is being written is read when it is whole.
                             if (event == G_FILE_MONITOR_EVENT_CHANGED || event == G_FILE_MONITOR_EVENT_ATTRIBUTE_CHANGED)
                               return;
                             {
                               const std::lock_guard lock(self->mutex_);
                               self->current_ = false;
                             }
                             self->notifications_.post({SyncedStoreDidChangeExternallyNotification, {}});
                           }),
                           this);
  const std::lock_guard lock(mutex_);
  watched_ = true;
  current_ = false;  // it may have changed before the watch began
}

}  // namespace vaelo
