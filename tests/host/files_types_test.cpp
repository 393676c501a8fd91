// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/files/g_types.h"

namespace vaelo {

namespace {

TEST(FilesTypesTest, ExtensionsHaveAType) {
  GTypes types;
  EXPECT_EQ(types.preferredIdentifierForExtension("JPG"), "public.jpeg");
  EXPECT_EQ(types.preferredIdentifierForExtension("pdf"), "com.adobe.pdf");
  EXPECT_EQ(types.preferredIdentifierForExtension("txt"), "public.plain-text");
  EXPECT_EQ(types.preferredIdentifierForExtension("Zzz"), "dyn.zzz");
  EXPECT_EQ(types.preferredIdentifierForExtension("\xff"), "dyn.\xff");
  EXPECT_EQ(types.preferredIdentifierForExtension(""), std::nullopt);
}

TEST(FilesTypesTest, Conformance) {
  GTypes types;
  struct Case {
    const char* type;
    const char* other;
    bool conforms;
  };
  for (const Case& row :
       {Case{"public.jpeg", "public.image", true}, Case{"public.jpeg", "public.data", true},
        Case{"public.jpeg", "public.content", true}, Case{"public.jpeg", "public.movie", false},
        Case{"public.image", "public.jpeg", false}, Case{"public.mp3", "public.audio", true},
        Case{"public.mpeg-4", "public.movie", true}, Case{"com.adobe.pdf", "public.data", true},
        Case{"net.daringfireball.markdown", "public.text", true}, Case{"public.folder", "public.data", false},
        Case{"com.marrow.rtfd", "com.marrow.package", true}, Case{"com.marrow.package", "public.data", false},
        Case{"dyn.zzz", "public.data", true}, Case{"dyn.zzz", "dyn.zzz", true}, Case{"dyn.zzz", "public.image", false},
        Case{"dyn.xcf", "public.image", true}, Case{"dyn.cpp", "public.text", true}, Case{"nonsense", "public.data", false},
        Case{"", "public.data", false}}) {
    EXPECT_EQ(types.conformsTo(row.type, row.other), row.conforms) << row.type << " " << row.other;
  }
}

TEST(FilesTypesTest, DescriptionsAreForPeople) {
  GTypes types;
  EXPECT_TRUE(types.description("public.folder"));
  EXPECT_NE(types.description("com.adobe.pdf"), types.description("public.jpeg"));
  EXPECT_EQ(types.description("nonsense"), std::nullopt);
  EXPECT_EQ(types.description("com.marrow.alias"), std::nullopt);
}

}  // namespace

}  // namespace vaelo
