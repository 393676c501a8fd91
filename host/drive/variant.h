// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <glib.h>

#include <memory>

namespace vaelo {

struct VariantFree {
  void operator()(GVariant* variant) const { g_variant_unref(variant); }
};
/// Owns one reference.
using Variant = std::unique_ptr<GVariant, VariantFree>;

}  // namespace vaelo
