// SPDX-License-Identifier: GPL-3.0-or-later
#include <archive.h>
#include <archive_entry.h>

#include <fstream>
#include <iterator>

#include "host/gtk/preview/archive_listing.h"
#include "host/gtk/preview/archive_load.h"
#include "tests/host/preview_view_test.h"

namespace vaelo {
namespace {

using list_test::waitUntil;

struct Packed {
  std::string name;
  std::string content = "x";
  bool isFolder = false;
};

using Setting = int (*)(archive*);

struct Archive {
  Setting format;
  Setting filter = archive_write_add_filter_none;
  const char* options = "";
};

std::string pack(const Archive& kind, const std::vector<Packed>& entries) {
  archive* packer = archive_write_new();
  kind.format(packer);
  kind.filter(packer);
  archive_write_set_options(packer, kind.options);
  archive_write_set_passphrase(packer, "secret");
  std::string bytes(32'000'000, '\0');
  std::size_t used = 0;
  EXPECT_EQ(archive_write_open_memory(packer, bytes.data(), bytes.size(), &used), ARCHIVE_OK)
      << archive_error_string(packer);
  for (const Packed& packed : entries) {
    archive_entry* entry = archive_entry_new();
    archive_entry_set_pathname_utf8(entry, packed.name.c_str());
    archive_entry_set_filetype(entry, packed.isFolder ? AE_IFDIR : AE_IFREG);
    archive_entry_set_perm(entry, 0644);
    archive_entry_set_mtime(entry, 1'700'000'000, 0);
    if (!packed.isFolder) archive_entry_set_size(entry, static_cast<la_int64_t>(packed.content.size()));
    archive_write_header(packer, entry);
    if (!packed.isFolder) archive_write_data(packer, packed.content.data(), packed.content.size());
    archive_entry_free(entry);
  }
  archive_write_close(packer);
  archive_write_free(packer);
  bytes.resize(used);
  return bytes;
}

const Archive Zip{archive_write_set_format_zip};
const Archive Tar{archive_write_set_format_pax_restricted};
const std::vector<Packed> Letters = {
    {"Letters", "", true}, {"Letters/ten 10.txt", "0123456789"}, {"Letters/two 2.txt"}, {"Picture.png"}};

std::string linesOf(const ArchiveListing& listing, std::uint32_t folder = 0, const std::string& indent = "") {
  std::string lines;
  for (const std::uint32_t index : listing.entry(folder).inside) {
    lines += indent + listing.entry(index).name + (listing.entry(index).isFolder ? "/" : "") + "\n";
    lines += linesOf(listing, index, indent + " ");
  }
  return lines;
}

TEST(ArchiveListingTest, FoldersAreMadeUpAndStandFirst) {
  ArchiveListing listing("?");
  listing.add(
      "file\t3\t1700000000\tb/c/2.txt\nfile\t4\t-\t./a 10.txt\nfile\t-\t-\ta 9.txt\nfolder\t-\t5\tb/\nfile\t1\t1\t\n");
  listing.sort();
  EXPECT_EQ(linesOf(listing), "b/\n c/\n  2.txt\n?\na 9.txt\na 10.txt\n");
  EXPECT_EQ(listing.files(), 4U);
  EXPECT_EQ(listing.folders(), 2U);
  EXPECT_EQ(listing.bytes(), 8U);
}

TEST(ArchiveListingTest, WhatIsNoLineIsLeftOut) {
  ArchiveListing listing("?");
  listing.add("\n\nfile\nnonsense\t1\t1\tx\nfile\t1\t1\t\xff\xfe\nfile\t-5\t99999999999999999999\tkept");
  listing.sort();
  EXPECT_EQ(linesOf(listing), "?\nkept\n");
  EXPECT_FALSE(listing.entry(2).size);
  EXPECT_FALSE(listing.entry(2).modified);
}

TEST(ArchiveListingTest, PathsThatClimbAreNamesAndDeepOnesEnd) {
  ArchiveListing listing("?");
  listing.add("file\t1\t1\t../../etc/x\n");
  std::string deep = "file\t1\t1\t";
  for (int i = 0; i < 400; ++i) deep += "d/";
  listing.add(deep + "end\n");
  listing.sort();
  EXPECT_EQ(linesOf(listing).substr(0, 22), "../\n ../\n  etc/\n   x\nd");
  EXPECT_LT(listing.folders(), 60U);
  EXPECT_EQ(listing.files(), 2U);
}

TEST(ArchiveListingTest, ThereIsAMostOfEntries) {
  ArchiveListing listing("?");
  std::string lines;
  for (int i = 0; i < 120'000; ++i) lines += "file\t1\t1\t" + std::to_string(i) + "/x\n";
  listing.add(lines);
  EXPECT_TRUE(listing.isFull());
  EXPECT_LE(listing.files() + listing.folders(), 100'000U);
}

class PreviewArchiveTest : public preview_test::PreviewViewTest {
 protected:
  void openArchive(const std::string& name, const std::string& type, const std::string& bytes) {
    std::ofstream(pathOf(name), std::ios::binary) << bytes;
    open(name, type);
  }
  std::string rows() {
    waitUntil([this] { return labelsIn(findIn(view_->widget(), GTK_TYPE_LIST_VIEW)) != ""; });
    return labelsIn(view_->widget());
  }
};

TEST_F(PreviewArchiveTest, ArchivesOfEachKindAreListed) {
  const struct {
    const char* name;
    const char* type;
    Archive kind;
  } cases[] = {
      {"a.zip", "application/zip", Zip},
      {"a.tar", "application/x-tar", Tar},
      {"a.tar.gz", "application/x-compressed-tar", {Tar.format, archive_write_add_filter_gzip}},
      {"a.tar.bz2", "application/x-bzip-compressed-tar", {Tar.format, archive_write_add_filter_bzip2}},
      {"a.tar.xz", "application/x-xz-compressed-tar", {Tar.format, archive_write_add_filter_xz}},
      {"a.tar.zst", "application/x-zstd-compressed-tar", {Tar.format, archive_write_add_filter_zstd}},
      {"a.7z", "application/x-7z-compressed", {archive_write_set_format_7zip}},
      {"a.iso", "application/x-cd-image", {archive_write_set_format_iso9660}},
      {"a.cpio", "application/x-cpio", {archive_write_set_format_cpio_newc}},
  };
  for (const auto& one : cases) {
    openArchive(one.name, one.type, pack(one.kind, Letters));
    ASSERT_EQ(failure_, "") << one.name;
    const std::string shown = rows();
    for (const char* part : {"Letters\n", "ten 10.txt\n", "two 2.txt\n", "Picture.png\n", "3 files, 1 folder"}) {
      EXPECT_NE(shown.find(part), std::string::npos) << one.name << " " << part << " in:\n" << shown;
    }
    EXPECT_LT(shown.find("two 2.txt"), shown.find("ten 10.txt") + shown.size()) << one.name;
  }
}

TEST_F(PreviewArchiveTest, ACompressedDocumentIsListedByTheNameThatItHad) {
  const Archive gzip{archive_write_set_format_raw, archive_write_add_filter_gzip};
  openArchive("letter.txt.gz", "application/gzip", pack(gzip, {{"x", "Dear all"}}));
  ASSERT_EQ(failure_, "");
  EXPECT_NE(rows().find("letter.txt\n"), std::string::npos) << rows();
  openArchive("plain.gz", "application/gzip", "not compressed at all");
  EXPECT_EQ(failure_, "This document is damaged and can’t be shown.");
}

TEST_F(PreviewArchiveTest, AnEmptyArchiveSaysSo) {
  openArchive("a.zip", "application/zip", pack(Zip, {}));
  ASSERT_EQ(failure_, "");
  EXPECT_NE(labelsIn(view_->widget()).find("This archive is empty."), std::string::npos);
}

TEST_F(PreviewArchiveTest, ADamagedArchiveSaysSo) {
  openArchive("a.zip", "application/zip", "This is no archive.");
  EXPECT_EQ(failure_, "This document is damaged and can’t be shown.");
  openArchive("a.7z", "application/x-7z-compressed", std::string("7z\xbc\xaf\x27\x1c\0\4", 8) + std::string(300, 'x'));
  EXPECT_EQ(failure_, "This document is damaged and can’t be shown.");
}

TEST_F(PreviewArchiveTest, OfAnArchiveThatIsCutTheBeginningIsListed) {
  std::vector<Packed> many;
  for (int i = 0; i < 40; ++i) many.push_back({"file " + std::to_string(i), std::string(3000, 'x')});
  const std::string whole = pack(Tar, many);
  openArchive("a.tar", "application/x-tar", whole.substr(0, whole.size() / 2));
  ASSERT_EQ(failure_, "");
  const std::string shown = rows();
  EXPECT_NE(shown.find("file 0\n"), std::string::npos) << shown;
  EXPECT_NE(shown.find("The archive is damaged"), std::string::npos) << shown;
}

TEST_F(PreviewArchiveTest, OfAZipWhoseDirectoryIsDamagedTheFilesAreListed) {
  std::string damaged = pack(Zip, Letters);
  damaged[damaged.find("PK\x01\x02") + 2] = 'x';
  openArchive("a.zip", "application/zip", damaged);
  ASSERT_EQ(failure_, "");
  const std::string shown = rows();
  EXPECT_NE(shown.find("Picture.png\n"), std::string::npos) << shown;
  EXPECT_NE(shown.find("The archive is damaged"), std::string::npos) << shown;
}

TEST_F(PreviewArchiveTest, ALockedArchiveIsListedOrSaysThatItIsLocked) {
  openArchive("a.zip", "application/zip", pack({Zip.format, Zip.filter, "zip:encryption=aes256"}, Letters));
  ASSERT_EQ(failure_, "");
  const std::string shown = rows();
  EXPECT_NE(shown.find("two 2.txt\n"), std::string::npos) << shown;
  EXPECT_NE(shown.find("The content is protected by a password."), std::string::npos) << shown;
}

TEST_F(PreviewArchiveTest, NamesThatLieAreShownAsTheyAre) {
  openArchive("a.zip", "application/zip",
              pack(Zip, {{"a\nb.txt"}, {"\u202egpj.exe"}, {"../../climbed"}, {std::string(5000, 'n')}}));
  ASSERT_EQ(failure_, "");
  const std::string shown = rows();
  EXPECT_EQ(shown.find("\u202e"), std::string::npos);
  EXPECT_NE(shown.find("a\xef\xbf\xbd"
                       "b.txt\n"),
            std::string::npos)
      << shown;
  EXPECT_NE(shown.find("\xef\xbf\xbdgpj.exe\n"), std::string::npos) << shown;
  EXPECT_NE(shown.find("..\n"), std::string::npos) << shown;
}

TEST_F(PreviewArchiveTest, NamesOfOldZipProgramsAreRead) {
  const std::string old = pack({Zip.format, Zip.filter, "zip:hdrcharset=CP437"}, {{"Grüße.txt"}});
  ASSERT_NE(old.find("Gr\x81\xe1"
                     "e.txt"),
            std::string::npos);
  openArchive("a.zip", "application/zip", old);
  ASSERT_EQ(failure_, "");
  EXPECT_NE(rows().find("Grüße.txt\n"), std::string::npos) << rows();
}

TEST_F(PreviewArchiveTest, ABombIsListedAndNotUnpacked) {
  const std::string bomb = pack(Zip, {{"zeroes", std::string(100'000'000, '\0')}});
  ASSERT_LT(bomb.size(), 1'000'000U);
  openArchive("a.zip", "application/zip", bomb);
  ASSERT_EQ(failure_, "");
  EXPECT_NE(rows().find("zeroes\n"), std::string::npos);
}

TEST_F(PreviewArchiveTest, OfVeryManyEntriesTheFirstAreListed) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "every name takes some memory, which takes a minute here";
#endif
  std::vector<Packed> many;
  for (int i = 0; i < 51'000; ++i) many.push_back({std::to_string(i), ""});
  openArchive("a.zip", "application/zip", pack(Zip, many));
  ASSERT_EQ(failure_, "");
  EXPECT_NE(labelsIn(view_->widget()).find("50,000 files. There are more"), std::string::npos)
      << labelsIn(view_->widget()).substr(0, 400);
}

TEST_F(PreviewArchiveTest, AFolderOpensAndClosesInItsPlace) {
  std::vector<Packed> many = {{"Folder", "", true}};
  for (int i = 0; i < 80; ++i) many.push_back({"Folder/file " + std::to_string(i)});
  many.push_back({"Beside"});
  openArchive("a.zip", "application/zip", pack(Zip, many));
  GtkWidget* list = findIn(view_->widget(), GTK_TYPE_LIST_VIEW);
  GListModel* model = G_LIST_MODEL(gtk_list_view_get_model(GTK_LIST_VIEW(list)));
  EXPECT_EQ(g_list_model_get_n_items(model), 2U) << "of many, the folders are closed";
  g_signal_emit_by_name(list, "activate", 0U);
  EXPECT_EQ(g_list_model_get_n_items(model), 82U);
  g_signal_emit_by_name(list, "activate", 0U);
  EXPECT_EQ(g_list_model_get_n_items(model), 2U);
}

TEST_F(PreviewArchiveTest, ADocumentThatChangedIsReadAnew) {
  openArchive("a.zip", "application/zip", pack(Zip, {{"before"}}));
  EXPECT_NE(rows().find("before\n"), std::string::npos);
  std::ofstream(pathOf("a.zip"), std::ios::binary) << pack(Zip, {{"after"}});
  view_->refresh();
  EXPECT_TRUE(waitUntil([this] { return labelsIn(view_->widget()).find("after\n") != std::string::npos; }));
}

TEST_F(PreviewArchiveTest, OfAnArchiveThatChangedTheOpenFoldersStayOpen) {
  std::vector<Packed> many;
  for (int i = 0; i < 40; ++i) {
    many.push_back({"Open/Inner/file " + std::to_string(i)});
    many.push_back({"Closed/file " + std::to_string(i)});
  }
  openArchive("a.zip", "application/zip", pack(Zip, many));
  GtkWidget* list = findIn(view_->widget(), GTK_TYPE_LIST_VIEW);
  const auto count = [list] { return g_list_model_get_n_items(G_LIST_MODEL(gtk_list_view_get_model(GTK_LIST_VIEW(list)))); };
  g_signal_emit_by_name(list, "activate", 1U);
  g_signal_emit_by_name(list, "activate", 2U);
  ASSERT_EQ(count(), 43U);
  GtkAdjustment* place = gtk_scrollable_get_vadjustment(GTK_SCROLLABLE(list));
  ASSERT_TRUE(waitUntil([place] { return gtk_adjustment_get_upper(place) > 1500; }));
  gtk_adjustment_set_value(place, 300);
  many.push_back({"Open/Inner/one more"});
  std::ofstream(pathOf("a.zip"), std::ios::binary) << pack(Zip, many);
  shown_ = 0;
  view_->refresh();
  ASSERT_TRUE(waitUntil([this] { return shown_ > 0; }));
  EXPECT_EQ(count(), 44U);
  for (int i = 0; i < 200; ++i) g_main_context_iteration(nullptr, FALSE);
  EXPECT_NEAR(gtk_adjustment_get_value(place), 300, 60) << "what was looked at stays where it is";
}

TEST_F(PreviewArchiveTest, AMissingArchiveSaysSo) {
  open("gone.zip", "application/zip");
  EXPECT_EQ(failure_, "This document is no longer there.");
}

TEST_F(PreviewArchiveTest, LeavingWhileItLoadsIsHarmless) {
  std::ofstream(pathOf("a.zip"), std::ios::binary) << pack(Zip, Letters);
  for (int i = 0; i < 10; ++i) begin("a.zip", "application/zip");
  open("a.zip", "application/zip");
  EXPECT_EQ(failure_, "");
}

}  // namespace
}  // namespace vaelo
