// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/media_framework.h"

#include <dlfcn.h>
#include <gst/gst.h>

#include <string_view>

namespace vaelo {

namespace {

/// The framework's functions, looked up when they are needed: few previews play anything, and linking it takes start-up
/// time.
class Framework {
 public:
  Framework() : library_(::dlopen("libgstreamer-1.0.so.0", RTLD_NOW | RTLD_LOCAL)) {
    const bool found =
        find(init, "gst_init_check") && find(registry, "gst_registry_get") &&
        find(features, "gst_registry_get_feature_list") && find(freeFeatures, "gst_plugin_feature_list_free") &&
        find(removeFeature, "gst_registry_remove_feature") && find(factoryType, "gst_element_factory_get_type") &&
        find(metadata, "gst_element_factory_get_metadata") && find(uriType, "gst_element_factory_get_uri_type") &&
        find(protocols, "gst_element_factory_get_uri_protocols");
    isReady_ = found && init(nullptr, nullptr, nullptr);
  }
  bool isReady() const { return isReady_; }

  void removeWhatReachesOut() const {
    GList* all = features(registry(), factoryType());
    for (GList* feature = all; feature; feature = feature->next) {
      if (reachesOut(GST_ELEMENT_FACTORY_CAST(feature->data))) {
        removeFeature(registry(), GST_PLUGIN_FEATURE_CAST(feature->data));
      }
    }
    freeFeatures(all);
  }

 private:
  template <typename Function>
  bool find(Function*& function, const char* name) const {
    function = library_ ? reinterpret_cast<Function*>(::dlsym(library_, name)) : nullptr;
    return function;
  }

  bool reachesOut(GstElementFactory* factory) const {
    const char* words = metadata(factory, GST_ELEMENT_METADATA_KLASS);
    const std::string_view kind = words ? words : "";
    if (kind.find("Network") != std::string_view::npos || kind.find("Adaptive") != std::string_view::npos) return true;
    if (uriType(factory) != GST_URI_SRC) return false;
    for (const char* const* protocol = protocols(factory); protocol && *protocol; ++protocol) {
      if (std::string_view(*protocol) != "file") return true;
    }
    return false;
  }

  void* library_;
  bool isReady_ = false;
  decltype(gst_init_check)* init = nullptr;
  decltype(gst_registry_get)* registry = nullptr;
  decltype(gst_registry_get_feature_list)* features = nullptr;
  decltype(gst_plugin_feature_list_free)* freeFeatures = nullptr;
  decltype(gst_registry_remove_feature)* removeFeature = nullptr;
  decltype(gst_element_factory_get_type)* factoryType = nullptr;
  decltype(gst_element_factory_get_metadata)* metadata = nullptr;
  decltype(gst_element_factory_get_uri_type)* uriType = nullptr;
  decltype(gst_element_factory_get_uri_protocols)* protocols = nullptr;
};

}  // namespace

bool prepareMediaFramework() {
  static const bool isReady = [] {
    const Framework framework;
    if (framework.isReady()) framework.removeWhatReachesOut();
    return framework.isReady();
  }();
  return isReady;
}

}  // namespace vaelo
