// SPDX-License-Identifier: GPL-3.0-or-later
#include "items/file_utils.h"
#include "tests/unit/items_world.h"

namespace vaelo {
namespace {

/// Names and types.
class NamesTest : public ItemsTest {
 protected:
  NamesTest() {
    world.typeOfExtension = {{"png", "public.png"}, {"pdf", "com.adobe.pdf"}, {"txt", "public.plain-text"}};
    world.conformances = {{"public.png", {"public.image", "public.data"}}};
  }
  bool isValidInLibrary(const std::string& name) {
    return FileUtils::isValidExtensionForContainer(LibraryDocuments.appendingPathComponent(name));
  }
  void declare(std::vector<Value> contentTypes) {
    world.appLibrary->types.emplace();
    for (Value& value : contentTypes) world.appLibrary->types->push_back({std::move(value)});
  }
};

TEST_F(NamesTest, namesThatAnItemMayHave) {
  for (const char* name : {"letter.txt", "   ", "a.b.c", "Überblick", "trailing."}) {
    EXPECT_TRUE(FileUtils::isValidFilename(name)) << name;
  }
  EXPECT_TRUE(FileUtils::isValidFilename(std::string(300, 'a')));
}

TEST_F(NamesTest, namesThatAnItemMayNotHave) {
  for (const char* name : {"", ".", ".hidden", "a/b", "a:b", "il\\legal", "tab\tinside", "line\nbreak"}) {
    EXPECT_FALSE(FileUtils::isValidFilename(name)) << name;
  }
}

TEST_F(NamesTest, theTypeIsThatOfTheExtension) {
  EXPECT_EQ(FileUtils::fileUTI(URL("/a/b.png")), "public.png");
  EXPECT_FALSE(FileUtils::fileUTI(URL("/a/b")));
  EXPECT_FALSE(FileUtils::fileUTI(URL("/a/b.zzz")));
}

TEST_F(NamesTest, picturesFilmsSoundAndPortableDocumentsAreMedia) {
  world.typeOfExtension["mov"] = "public.mov";
  world.typeOfExtension["mp3"] = "public.mp3";
  world.conformances["public.mov"] = {"public.movie", "public.audio"};
  world.conformances["public.mp3"] = {"public.audio"};
  for (const auto& [extension, type, media] :
       {std::tuple{"png", "public.png", "public.image"}, std::tuple{"mov", "public.mov", "public.movie"},
        std::tuple{"mp3", "public.mp3", "public.audio"}, std::tuple{"pdf", "com.adobe.pdf", "com.adobe.pdf"}}) {
    world.recordedLog.clear();
    EXPECT_TRUE(FileUtils::isAudioVideoImageFile(URL(std::string("/a/b.") + extension)));
    EXPECT_EQ(messages(), std::vector{std::string("DEBUG isAudioVideoImageFile: Extension ") + extension + " is " + type +
                                      " which conforms to UTI " + media});
  }
}

TEST_F(NamesTest, whatIsNoMediaIsToldAndWhatHasNoTypeIsNot) {
  EXPECT_FALSE(FileUtils::isAudioVideoImageFile(URL("/a/b.txt")));
  EXPECT_EQ(messages(),
            std::vector<std::string>{"DEBUG isAudioVideoImageFile: Extension txt is public.plain-text which is not."});
  world.recordedLog.clear();
  world.typeOfExtension["empty"] = "";
  for (const char* path : {"/a/b", "/a/b.zzz", "/a/b.empty"}) EXPECT_FALSE(FileUtils::isAudioVideoImageFile(URL(path)));
  EXPECT_TRUE(messages().empty());
}

TEST_F(NamesTest, aFileWithoutExtensionOrTypeIsWelcomeAnywhere) {
  declare({Array{"public.image"}});
  EXPECT_TRUE(isValidInLibrary("plain"));
  EXPECT_TRUE(isValidInLibrary("a.zzz"));
  EXPECT_FALSE(isValidInLibrary("a.txt"));
}

TEST_F(NamesTest, theDriveAndALibraryThatDeclaresNothingTakeEverything) {
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(Drive.appendingPathComponent("a.txt")));
  EXPECT_TRUE(isValidInLibrary("a.txt"));
  declare({});
  EXPECT_TRUE(isValidInLibrary("a.txt"));
  world.drive->types.emplace({DeclaredDocumentType{Array{"public.image"}}});
  EXPECT_TRUE(FileUtils::isValidExtensionForContainer(Drive.appendingPathComponent("a.txt")));
}

TEST_F(NamesTest, noContainerOrNoDocumentsFolderTakesNothing) {
  EXPECT_FALSE(FileUtils::isValidExtensionForContainer(URL("/outside/a.txt")));
  world.appLibrary->folder = std::nullopt;
  EXPECT_FALSE(isValidInLibrary("a.txt"));
  EXPECT_TRUE(messages().empty());
}

TEST_F(NamesTest, anErrorOfTheLookupIsIgnoredWhenAContainerComesWithIt) {
  world.containerError = fileError(FileErrorCode::ReadUnknown);
  EXPECT_FALSE(isValidInLibrary("a.txt"));
  world.containerErrorComesWithValue = true;
  EXPECT_TRUE(isValidInLibrary("a.txt"));
}

TEST_F(NamesTest, aTypeThatConformsIsWelcome) {
  declare({Array{"public.movie"}, Array{"public.image"}});
  EXPECT_TRUE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages(), std::vector<std::string>{"INFO Extension png conforms to UTI public.image"});
}

TEST_F(NamesTest, theGenericTypesWelcomeEverything) {
  for (const char* generic : {"public.data", "public.content"}) {
    world.recordedLog.clear();
    declare({Array{"public.movie", generic}});
    EXPECT_TRUE(isValidInLibrary("a.txt"));
    EXPECT_EQ(messages(), std::vector<std::string>{"INFO Container supports all UTIs"});
  }
}

TEST_F(NamesTest, brokenDeclarations) {
  declare({Array{std::int64_t{3}, "public.image"}});
  EXPECT_TRUE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages().front(), "ERROR Expected array of strings");
  world.recordedLog.clear();
  declare({Array{"public.image"}, "not a list"});
  EXPECT_FALSE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages(), std::vector<std::string>{"ERROR Expected content types of Set"});
  world.recordedLog.clear();
  declare({Value(), Array{"public.image"}});
  EXPECT_TRUE(isValidInLibrary("a.png"));
}

TEST_F(NamesTest, aTypeDeclaredTwiceIsLookedAtOnce) {
  declare({Array{std::int64_t{3}}, Array{std::int64_t{3}}});
  EXPECT_FALSE(isValidInLibrary("a.png"));
  EXPECT_EQ(messages().size(), 1u);
}

}  // namespace
}  // namespace vaelo
