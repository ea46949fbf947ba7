// The index beside .fng files, and the import of directories with it.
#include <gmock/gmock.h>

#include <filesystem>
#include <utility>

#include "FngTestSupport.h"
#include "HostTestSupport.h"
#include "importers/FngImport.h"

namespace {

using host::Gesture;
using host_test::ErrorOf;
using host_test::FngBytes;
using host_test::TestDirectory;
using host_test::WriteBytes;
using host_test::WriteText;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::StartsWith;

constexpr const char* kColumns = "id,tier,mode,layout,kind,expect,accept,end,frames\n";
constexpr const char* kRow = "g,hard,fp,tiled,stroke:UP,UP,UP NO_MOVE,lift,2\n";

// A directory with g.fng and this index.
std::string DirectoryWithIndex(const std::string& index) {
    const std::string directory = TestDirectory();
    WriteBytes(directory + "/g.fng", FngBytes());
    WriteText(directory + "/index.csv", index);
    return directory;
}

std::string IndexError(const std::string& index) {
    const std::string directory = DirectoryWithIndex(index);
    return ErrorOf([&] { host::ImportFng(directory); });
}

TEST(FngIndex, RowAddsKeysTierAndTags) {
    const std::string directory = DirectoryWithIndex(std::string(kColumns) + kRow);
    const std::vector<Gesture> gestures = host::ImportFng(directory);
    ASSERT_EQ(gestures.size(), 1U);
    EXPECT_THAT(gestures[0].accepted, ElementsAre(VKEY_UP, VKEY_NO_MOVE));
    EXPECT_EQ(gestures[0].tier, "hard");
    EXPECT_THAT(gestures[0].tags, ElementsAre("tiled", "stroke:UP"));
}

TEST(FngIndex, IsUsedForASingleFileToo) {
    const std::string directory = DirectoryWithIndex(std::string(kColumns) + kRow);
    EXPECT_EQ(host::ImportFng(directory + "/g.fng").at(0).tier, "hard");
}

TEST(FngIndex, FilesComeInTheOrderOfTheirNamesAndWithoutARowIfNone) {
    const std::string directory = DirectoryWithIndex(std::string(kColumns) + kRow);
    WriteBytes(directory + "/a.fng", FngBytes());
    WriteBytes(directory + "/z.fng", FngBytes());
    const std::vector<Gesture> gestures = host::ImportFng(directory);
    ASSERT_EQ(gestures.size(), 3U);
    EXPECT_EQ(gestures[0].id, "a");
    EXPECT_EQ(gestures[0].tier, "");
    EXPECT_EQ(gestures[1].id, "g");
    EXPECT_EQ(gestures[1].tier, "hard");
    EXPECT_EQ(gestures[2].id, "z");
}

TEST(FngIndex, LinesMayEndLikeOnWindows) {
    std::string index = std::string(kColumns) + kRow;
    for (size_t at = index.find('\n'); at != std::string::npos; at = index.find('\n', at + 2))
        index.insert(at, "\r");
    EXPECT_EQ(host::ImportFng(DirectoryWithIndex(index)).at(0).tier, "hard");
}

TEST(FngIndex, MalformedRowsAreRefusedWithTheirLine) {
    const std::pair<const char*, const char*> rows[] = {
        {"h,hard,fp,tiled,stroke:UP,UP,UP,lift", "8 fields, expected 9"},
        {"h,hard,fp,tiled,stroke:UP,UP,UP,lift,2,9", "10 fields, expected 9"},
        {"", "1 fields, expected 9"},
        {",hard,fp,tiled,stroke:UP,UP,UP,lift,2", "id is empty"},
        {"h,soft,fp,tiled,stroke:UP,UP,UP,lift,2", "tier 'soft'"},
        {"h,hard,xp,tiled,stroke:UP,UP,UP,lift,2", "mode 'xp'"},
        {"h,hard,fp,round,stroke:UP,UP,UP,lift,2", "layout 'round'"},
        {"h,hard,fp,tiled,,UP,UP,lift,2", "kind is empty"},
        {"h,hard,fp,tiled,stroke:UP,OVER,UP,lift,2", "expect 'OVER'"},
        {"h,hard,fp,tiled,stroke:UP,UP,,lift,2", "accept is empty"},
        {"h,hard,fp,tiled,stroke:UP,UP,UP  DOWN,lift,2", "accept ''"},
        {"h,hard,fp,tiled,stroke:UP,UP,DOWN,lift,2", "accept has no UP"},
        {"h,hard,fp,tiled,stroke:UP,UP,UP,never,2", "end 'never'"},
        {"h,hard,fp,tiled,stroke:UP,UP,UP,lift,2x", "frames '2x'"},
        {"g,hard,fp,tiled,stroke:UP,UP,UP,lift,2", "in line 2 already"},
    };
    for (const auto& [row, text] : rows) {
        const std::string error = IndexError(std::string(kColumns) + kRow + row + "\n");
        EXPECT_THAT(error, HasSubstr("index.csv:3: ")) << row;
        EXPECT_THAT(error, HasSubstr(text)) << row;
    }
}

TEST(FngIndex, MissingColumnIsRefused) {
    EXPECT_THAT(IndexError("id,tier\n"), HasSubstr("index.csv:1: expected one column mode"));
    EXPECT_THAT(IndexError(""), HasSubstr("index.csv:1: expected one column id"));
}

TEST(FngIndex, RowThatContradictsTheFileIsRefused) {
    const std::pair<const char*, const char*> rows[] = {
        {"g,hard,hg,tiled,stroke:UP,UP,UP,lift,2", "mode"},
        {"g,hard,fp,plain,stroke:UP,UP,UP,lift,2", "layout"},
        {"g,hard,fp,tiled,stroke:UP,DOWN,DOWN,lift,2", "expect"},
        {"g,hard,fp,tiled,stroke:UP,,UP,lift,2", "expect"},
        {"g,hard,fp,tiled,stroke:UP,UP,UP,timeout,2", "end"},
        {"g,hard,fp,tiled,stroke:UP,UP,UP,lift,3", "frames"},
    };
    for (const auto& [row, column] : rows)
        EXPECT_THAT(IndexError(std::string(kColumns) + row + "\n"),
                    HasSubstr(std::string("index.csv:2: ") + column + " of 'g' differs"))
            << row;
}

TEST(FngIndex, ARowWithoutItsFileIsRefused) {
    const std::string directory = DirectoryWithIndex(std::string(kColumns) + kRow +
                                                     "h,hard,fp,tiled,stroke:UP,UP,UP,lift,2\n");
    EXPECT_THAT(ErrorOf([&] { host::ImportFng(directory); }),
                HasSubstr("index.csv:3: 'h' has no file, expected h.fng beside the index"));
    // Who imports a single file wants no other.
    EXPECT_EQ(host::ImportFng(directory + "/g.fng").size(), 1U);
}

TEST(FngDirectory, ExtensionsInCapitalsAreTaken) {
    const std::string directory = TestDirectory();
    WriteBytes(directory + "/A.FNG", FngBytes());
    const std::vector<Gesture> gestures = host::ImportFng(directory);
    ASSERT_EQ(gestures.size(), 1U);
    EXPECT_EQ(gestures[0].id, "A");
}

TEST(FngDirectory, DirectoriesBelowAreTakenWithTheirOwnIndex) {
    const std::string directory = TestDirectory();
    std::filesystem::create_directories(directory + "/day/morning");
    WriteBytes(directory + "/day/morning/g.fng", FngBytes());
    WriteText(directory + "/day/morning/index.csv", std::string(kColumns) + kRow);
    WriteBytes(directory + "/z.fng", FngBytes());
    const std::vector<Gesture> gestures = host::ImportFng(directory);
    ASSERT_EQ(gestures.size(), 2U);
    EXPECT_EQ(gestures[0].id, "z");  // a directory's files come before those below it
    EXPECT_EQ(gestures[0].tier, "");
    EXPECT_EQ(gestures[1].id, "g");
    EXPECT_EQ(gestures[1].tier, "hard");
}

TEST(FngDirectory, ALinkBackIsRefused) {
    const std::string directory = TestDirectory();
    WriteBytes(directory + "/g.fng", FngBytes());
    std::filesystem::create_directory_symlink(directory, directory + "/loop");
    EXPECT_THAT(ErrorOf([&] { host::ImportFng(directory); }),
                StartsWith(directory + "/loop: is reached twice"));
}

TEST(FngDirectory, ANameThatIsNoUtf8IsRefused) {
    const std::string file = TestDirectory() + "/a\xFFz.fng";
    WriteBytes(file, FngBytes());
    EXPECT_THAT(ErrorOf([&] { host::ImportFng(file); }), HasSubstr("the name is no UTF-8"));
}

TEST(FngIndex, AKeyThatIsNearlyOneIsNamed) {
    EXPECT_THAT(IndexError(std::string(kColumns) + "g,hard,fp,tiled,stroke:UP,PU,UP,lift,2\n"),
                HasSubstr("index.csv:2: expect 'PU', did you mean 'UP'?"));
}

TEST(FngIndex, DirectoryWithoutRecordingsIsRefused) {
    const std::string directory = TestDirectory();
    EXPECT_THAT(ErrorOf([&] { host::ImportFng(directory); }),
                StartsWith(directory + ": has no .fng files"));
    EXPECT_THAT(ErrorOf([&] { host::ImportFng(directory + "/none.fng"); }),
                HasSubstr("none.fng: cannot be opened"));
}

}  // namespace
