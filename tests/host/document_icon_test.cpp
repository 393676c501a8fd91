// SPDX-License-Identifier: GPL-3.0-or-later
#include <adwaita.h>
#include <gtest/gtest.h>

#include "host/gtk/pango_graphics.h"
#include "tests/support/memory_platform.h"

namespace vaelo {
namespace {

class DocumentIconTest : public testing::Test {
 protected:
  DocumentIconTest() { adw_init(); }
  /// Of the icon, of which themes have variants.
  static std::string nameOf(const char* file, const std::optional<std::string>& type) {
    const ImageRef icon = PangoGraphics().documentIcon(file, type, IconFormat::Large);
    const char* name =
        gtk_icon_paintable_get_icon_name(GTK_ICON_PAINTABLE(dynamic_cast<const GtkImageData&>(*icon).paintable()));
    return name ? name : "";
  }
  MemoryPlatform memory;
};

TEST_F(DocumentIconTest, ADocumentHasThatOfItsName) {
  EXPECT_EQ(nameOf("Report.txt", "public.plain-text").substr(0, 4), "text");
  EXPECT_EQ(nameOf("Report.txt", std::nullopt).substr(0, 4), "text");
  EXPECT_NE(nameOf("Report.png", "public.png"), nameOf("Report.txt", "public.plain-text"));
}

TEST_F(DocumentIconTest, PackagesAndFoldersHaveThoseOfTheirTypes) {
  for (const char* type : {"com.marrow.package", "com.marrow.rtfd"}) {
    EXPECT_EQ(nameOf("Drawing.sketchbundle", type), "package-x-generic") << type;
  }
  EXPECT_EQ(nameOf("Plans.txt", "public.folder"), nameOf("Other", "public.folder"));
  EXPECT_NE(nameOf("Plans.txt", "public.folder"), nameOf("Plans.txt", "public.plain-text"));
}

}  // namespace
}  // namespace vaelo
