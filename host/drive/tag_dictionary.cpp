// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/tag_dictionary.h"

#include "host/drive/small_file.h"
#include "host/drive/variant.h"
#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

constexpr const char* DictionaryKey = "RoverTagDict";
constexpr const char* VersionKey = "RoverTagDictVersion";
constexpr const char* TagsKey = "RoverTags";
constexpr guint64 KnownVersion = 2;

Variant ofKey(GVariant* dictionary, const char* key) { return Variant(g_variant_lookup_value(dictionary, key, nullptr)); }

/// The program that writes the tags may keep a number in any of these.
std::optional<guint64> numberIn(GVariant* value) {
  if (!value) return std::nullopt;
  if (g_variant_is_of_type(value, G_VARIANT_TYPE_UINT64)) return g_variant_get_uint64(value);
  if (g_variant_is_of_type(value, G_VARIANT_TYPE_UINT32)) return g_variant_get_uint32(value);
  if (g_variant_is_of_type(value, G_VARIANT_TYPE_INT32)) return static_cast<guint64>(g_variant_get_int32(value));
  if (g_variant_is_of_type(value, G_VARIANT_TYPE_INT64)) return static_cast<guint64>(g_variant_get_int64(value));
  return std::nullopt;
}

bool isNamed(GVariant* entry, const std::string& name) {
  Variant tag(g_variant_is_of_type(entry, G_VARIANT_TYPE_VARIANT) ? g_variant_get_variant(entry) : g_variant_ref(entry));
  if (!g_variant_is_of_type(tag.get(), G_VARIANT_TYPE_VARDICT)) return false;
  const Variant named = ofKey(tag.get(), "n");
  return named && g_variant_is_of_type(named.get(), G_VARIANT_TYPE_STRING) &&
         name == g_variant_get_string(named.get(), nullptr);
}

GVariant* newTag(const std::string& name, unsigned label) {
  GVariantDict tag;
  g_variant_dict_init(&tag, nullptr);
  g_variant_dict_insert(&tag, "n", "s", name.c_str());
  g_variant_dict_insert(&tag, "l", "t", guint64{label});
  return g_variant_dict_end(&tag);
}

/// Null when the tag is in the list already. `tags` may be null.
GVariant* listWith(GVariant* tags, const std::string& name, unsigned label) {
  const bool holdsVariants = tags && g_variant_is_of_type(tags, G_VARIANT_TYPE("av"));
  GVariantBuilder list;
  g_variant_builder_init(&list, holdsVariants ? G_VARIANT_TYPE("av") : G_VARIANT_TYPE("aa{sv}"));
  for (gsize i = 0; tags && i < g_variant_n_children(tags); ++i) {
    const Variant entry(g_variant_get_child_value(tags, i));
    if (isNamed(entry.get(), name)) {
      g_variant_builder_clear(&list);
      return nullptr;
    }
    g_variant_builder_add_value(&list, entry.get());
  }
  GVariant* tag = newTag(name, label);
  g_variant_builder_add_value(&list, holdsVariants ? g_variant_new_variant(tag) : tag);
  return g_variant_builder_end(&list);
}

Error unknownForm() { return fileError(FileErrorCode::FeatureUnsupported, DictionaryKey, "another version wrote the tags"); }

}  // namespace

Result<std::string> valuesWithTag(const std::string& text, const std::string& name, unsigned label) {
  Variant values;
  if (!text.empty()) {
    GError* problem = nullptr;
    values.reset(g_variant_parse(G_VARIANT_TYPE_VARDICT, text.data(), text.data() + text.size(), nullptr, &problem));
    if (const GErrorPtr owned(problem); owned) return fileError(FileErrorCode::ReadUnknown, DictionaryKey, owned->message);
  }
  const Variant dictionary = values ? ofKey(values.get(), DictionaryKey) : Variant();
  Variant tags;
  if (dictionary) {
    if (!g_variant_is_of_type(dictionary.get(), G_VARIANT_TYPE_VARDICT)) return unknownForm();
    if (numberIn(ofKey(dictionary.get(), VersionKey).get()) != KnownVersion) return unknownForm();
    tags = ofKey(dictionary.get(), TagsKey);
    const bool isList = !tags || g_variant_is_of_type(tags.get(), G_VARIANT_TYPE("aa{sv}")) ||
                        g_variant_is_of_type(tags.get(), G_VARIANT_TYPE("av"));
    if (!isList) return unknownForm();
  }
  GVariant* list = listWith(tags.get(), name, label);
  if (!list) return text;
  GVariantDict changed;
  g_variant_dict_init(&changed, dictionary.get());
  g_variant_dict_insert_value(&changed, VersionKey, g_variant_new_uint64(KnownVersion));
  g_variant_dict_insert_value(&changed, TagsKey, list);
  GVariantDict all;
  g_variant_dict_init(&all, values.get());
  g_variant_dict_insert_value(&all, DictionaryKey, g_variant_dict_end(&changed));
  const Variant whole(g_variant_ref_sink(g_variant_dict_end(&all)));
  return takeString(g_variant_print(whole.get(), TRUE)) + "\n";
}

}  // namespace vaelo
