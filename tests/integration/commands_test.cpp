// Every command, for people and for programs.

#include <fcntl.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <fstream>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

using testing::AllOf;
using testing::Contains;
using testing::ContainsRegex;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using testing::StartsWith;
using testing::UnorderedElementsAre;

class Commands : public VantrellTest {
 protected:
  std::vector<std::string> names(const Words& words) {
    std::vector<std::string> result;
    for (const Json& record : objects(words)) result.push_back(record["filename"]);
    return result;
  }
};

TEST_F(Commands, LsListsWhatIsDirectlyInTheStorage) {
  write("a.txt", "hello");
  write("Letters/b.txt", "deep");
  write(".hidden", "x");
  EXPECT_THAT(names({"ls"}), UnorderedElementsAre("a.txt", "Letters"));
  EXPECT_THAT(names({"ls", "root"}), UnorderedElementsAre("a.txt", "Letters"));
}

TEST_F(Commands, LsTakesAFolderByPathAndByIdentifier) {
  write("Letters/b.txt", "deep");
  const std::string identifier = identifierOf(path("Letters"));
  EXPECT_THAT(identifier, StartsWith("fid="));
  EXPECT_THAT(names({"ls", "Letters"}), ElementsAre("b.txt"));
  EXPECT_THAT(names({"ls", path("Letters")}), ElementsAre("b.txt"));
  EXPECT_THAT(names({"ls", identifier}), ElementsAre("b.txt"));
}

TEST_F(Commands, LsOfAnEmptyFolderPrintsNothing) {
  EXPECT_THAT(objects({"ls"}), IsEmpty());
  EXPECT_EQ(vantrell({"ls"}).out, "");
}

TEST_F(Commands, LsShowsEveryEntryOfAFolderOfSeveralPages) {
  for (int i = 0; i < 450; ++i) write("file" + std::to_string(i), "x");
  const std::vector<std::string> all = names({"ls"});
  EXPECT_THAT(all, SizeIs(450));
  EXPECT_EQ(std::set<std::string>(all.begin(), all.end()).size(), 450U);
}

TEST_F(Commands, LsForPeopleIsAlignedAndEscaped) {
  write("a.txt", std::string(1500, 'x'));
  write("Letters/b.txt", "deep");
  write("\x1b[31mred", "x");
  const std::string out = vantrell({"ls"}).out;
  EXPECT_THAT(out, AllOf(ContainsRegex("did=[0-9]+ +file +1.5 kB  [0-9-]+ [0-9:]+  a.txt\n"),
                         ContainsRegex("fid=[0-9]+ +folder +1 item  .*  Letters\n"),
                         HasSubstr("\\x1B[31mred\n")));
  EXPECT_EQ(out.find('\x1b'), std::string::npos);
}

TEST_F(Commands, ColorIsForTerminalsUnlessAskedFor) {
  makeFolder("Letters");
  EXPECT_EQ(vantrell({"ls"}).out.find('\x1b'), std::string::npos);
  EXPECT_NE(vantrell({"ls", "--color=always"}).out.find('\x1b'), std::string::npos);
  EXPECT_EQ(vantrell({"ls", "--color=never"}).out.find('\x1b'), std::string::npos);
}

TEST_F(Commands, LsWithPrint0GivesRawPaths) {
  write("b\nc", "x");
  EXPECT_EQ(vantrell({"ls", "--print0"}).out, path("b\nc") + '\0');
}

TEST_F(Commands, LsOfAFileIsAnError) {
  write("a.txt", "x");
  const Json refused = error({"ls", "a.txt"});
  EXPECT_EQ(refused["domain"], "FndPOSIXErrorDomain");
  EXPECT_EQ(refused["name"], "ENOTDIR");
}

TEST_F(Commands, ContainersThatSpanFoldersAreNotHereYet) {
  for (const char* container : {"working-set", "all-directories"}) {
    const Json refused = error({"ls", container});
    EXPECT_EQ(refused["domain"], "com.quillon.vantrell");
    EXPECT_EQ(refused["code"], 1);
  }
}

TEST_F(Commands, ItemShowsTheRecordOfAFile) {
  write("a.txt", "hello");
  const Json record = object({"item", "a.txt"});
  EXPECT_THAT(record["itemIdentifier"], StartsWith("did="));
  EXPECT_EQ(record["parentItemIdentifier"], "DochostRootContainerItemIdentifier");
  EXPECT_EQ(record["filename"], "a.txt");
  EXPECT_EQ(record["typeIdentifier"], "text/plain");
  EXPECT_EQ(record["documentSize"], 5);
  EXPECT_EQ(record["capabilities"], 3);
  EXPECT_EQ(record["isTrashed"], false);
  EXPECT_EQ(record["dh_isUbiquitous"], false);
  EXPECT_EQ(record["fileURL"], "file://" + path("a.txt"));
  EXPECT_EQ("did=" + std::to_string(record["docID"].get<std::uint64_t>()),
            record["itemIdentifier"]);
  EXPECT_TRUE(record["fileID"].is_number_unsigned());
  for (const char* key : {"creationDate", "contentModificationDate"}) {
    EXPECT_THAT(record[key], testing::MatchesRegex("20[0-9-]+T[0-9:]+(\\.[0-9]+)?Z")) << key;
  }
  for (const char* key : {"tags", "favoriteRank", "lastUsedDate", "childItemCount", "putBackURL",
                          "dh_lumenDomainIdentifier", "dh_appContainerBundleIdentifier"}) {
    EXPECT_FALSE(record.contains(key)) << key;
  }
}

TEST_F(Commands, ItemShowsTheRecordOfTheRoot) {
  write("a.txt", "hello");
  const Json record = object({"item", "root"});
  EXPECT_EQ(record["itemIdentifier"], "DochostRootContainerItemIdentifier");
  EXPECT_EQ(record["parentItemIdentifier"], "DochostRootContainerItemIdentifier");
  EXPECT_EQ(record["capabilities"], 1);
  EXPECT_EQ(record["childItemCount"], 1);
  EXPECT_EQ(object({"item", storage()}), record);
}

TEST_F(Commands, ItemForPeopleHasAFieldALine) {
  write("a.txt", "hello");
  EXPECT_THAT(vantrell({"item", "a.txt"}).out,
              AllOf(ContainsRegex("itemIdentifier +did=[0-9]+\n"),
                    ContainsRegex("filename +a.txt\n"), ContainsRegex("isTrashed +false\n")));
}

TEST_F(Commands, PackagesAreDocuments) {
  write("book.tessera/content", "12345");
  const Json record = object({"item", "book.tessera"});
  EXPECT_THAT(record["itemIdentifier"], StartsWith("did="));
  EXPECT_EQ(record["typeIdentifier"], "com.quillon.tessera.document");
  EXPECT_EQ(record["documentSize"], 5);
  EXPECT_FALSE(record.contains("childItemCount"));
}

TEST_F(Commands, IdAndPathAreEachOthersInverse) {
  const std::string file = write("Letters/a.txt", "hello");
  const std::string identifier = identifierOf(file);
  EXPECT_EQ(pathOf(identifier), file);
  EXPECT_EQ(vantrell({"id", file}).out, identifier + "\n");
  EXPECT_EQ(vantrell({"id", file, "--print0"}).out, identifier + '\0');
  EXPECT_EQ(vantrell({"path", identifier}).out, file + "\n");
  EXPECT_EQ(vantrell({"path", identifier, "--print0"}).out, file + '\0');
  EXPECT_EQ(pathOf("root"), storage());
}

TEST_F(Commands, PathsAreRelativeToWhereTheProgramRuns) {
  const std::string file = write("Letters/a.txt", "hello");
  const std::string identifier = identifierOf(file);
  EXPECT_EQ(identifierOf("Letters/../Letters/./a.txt"), identifier);
  Invocation elsewhere = invocation({"id", "a.txt"});
  elsewhere.folder = path("Letters");
  EXPECT_EQ(run(elsewhere).out, identifier + "\n");
}

TEST_F(Commands, ANameThatLooksLikeAnIdentifierIsAPathWhenItIsWrittenAsOne) {
  write("did=5", "x");
  write("root", "x");
  write("-n", "x");
  EXPECT_EQ(object({"item", "./did=5"})["filename"], "did=5");
  EXPECT_EQ(object({"item", "./root"})["filename"], "root");
  EXPECT_EQ(object({"item", "--", "-n"})["filename"], "-n");
  EXPECT_EQ(object({"id", "did=5"})["itemIdentifier"], identifierOf("./did=5"));
}

TEST_F(Commands, TagReplacesTheTags) {
  write("a.txt", "hello");
  EXPECT_THAT(object({"tag", "a.txt", "Work", "b c"})["tags"], ElementsAre("Work", "b c"));
  EXPECT_THAT(object({"item", "a.txt"})["tags"], ElementsAre("Work", "b c"));
  EXPECT_THAT(vantrell({"ls"}).out, HasSubstr("a.txt  [Work, b c]\n"));
  EXPECT_THAT(object({"tag", "a.txt"})["tags"], IsEmpty());
  EXPECT_TRUE(object({"item", "a.txt"}).contains("tags"));
  EXPECT_THAT(vantrell({"tag", "a.txt", "--", "-x"}).out, ContainsRegex("tags +-x\n"));
}

TEST_F(Commands, TagsOfFoldersPackagesAndTheRootAreKeptToo) {
  makeFolder("Letters");
  write("book.tessera/content", "12345");
  for (const std::string item : {"Letters", "book.tessera", "root"}) {
    EXPECT_THAT(object({"tag", item, "x"})["tags"], ElementsAre("x")) << item;
  }
}

TEST_F(Commands, RankIsSetAndCleared) {
  write("a.txt", "hello");
  EXPECT_EQ(object({"rank", "a.txt", "7"})["favoriteRank"], 7);
  EXPECT_EQ(object({"rank", "a.txt", "18446744073709551615"})["favoriteRank"],
            18446744073709551615U);
  EXPECT_EQ(object({"item", "a.txt"})["favoriteRank"], 18446744073709551615U);
  EXPECT_FALSE(object({"rank", "a.txt", "--clear"}).contains("favoriteRank"));
  EXPECT_FALSE(object({"rank", "a.txt", "--clear"}).contains("favoriteRank"));
  EXPECT_THAT(vantrell({"rank", "a.txt", "3"}).out, ContainsRegex("favoriteRank +3\n"));
}

TEST_F(Commands, UsedIsSetAndCleared) {
  write("a.txt", "hello");
  EXPECT_EQ(object({"used", "a.txt", "2026-11-21T18:53:15.25+01:00"})["lastUsedDate"],
            "2026-11-21T17:53:15.25Z");
  EXPECT_EQ(object({"item", "a.txt"})["lastUsedDate"], "2026-11-21T17:53:15.25Z");
  EXPECT_FALSE(object({"used", "a.txt", "--clear"}).contains("lastUsedDate"));
  EXPECT_THAT(object({"used", "a.txt", "now"})["lastUsedDate"], StartsWith("20"));
  EXPECT_THAT(vantrell({"used", "a.txt", "1969-07-20T20:17:40Z"}).out,
              ContainsRegex("lastUsedDate +1969-07-20T20:17:40Z\n"));
}

TEST_F(Commands, SettersSayWhatTheyChangedByPathWithPrint0) {
  const std::string file = write("a.txt", "hello");
  EXPECT_EQ(vantrell({"tag", "a.txt", "x", "--print0"}).out, file + '\0');
}

TEST_F(Commands, DoctorTellsWhatIsRecordedAndWhere) {
  write("Letters/a.txt", "hello");
  (void)identifierOf(path("Letters/a.txt"));
  const Json report = object({"doctor"});
  EXPECT_EQ(report["storageRoot"], storage().native());
  EXPECT_EQ(report["stateFolder"], stateFolder().native());
  EXPECT_THAT(report["module"], HasSubstr("libvantrell.so"));
  EXPECT_EQ(report["backend"], "looks at start only");
  EXPECT_EQ(report["extendedAttributes"], true);
  EXPECT_THAT(report["volumeUUID"], testing::MatchesRegex("[0-9A-F-]{36}"));
  EXPECT_THAT(report["fileSystemType"], testing::Not(IsEmpty()));
  EXPECT_TRUE(report["device"].is_number_unsigned());
  EXPECT_EQ(report["database"]["path"], database().native());
  EXPECT_EQ(report["database"]["entries"], 2);
  EXPECT_EQ(report["database"]["documents"], 1);
  EXPECT_GT(report["database"]["bytes"], 0);
  EXPECT_GT(report["database"]["highestDocumentID"], 0);
  EXPECT_EQ(report["look"]["created"], 0);
  EXPECT_EQ(report["look"]["entriesSeen"], 2);
  EXPECT_THAT(report["look"]["unreadableFolders"], IsEmpty());
  EXPECT_THAT(vantrell({"doctor"}).out, ContainsRegex("database.entries +2\n"));
}

TEST_F(Commands, TheVolumeKeepsItsIdentity) {
  const Json uuid = object({"doctor"})["volumeUUID"];
  EXPECT_EQ(object({"doctor"})["volumeUUID"], uuid);
}

TEST_F(Commands, VerboseLogsToStandardErrorAndLeavesTheResultAlone) {
  write("a.txt", "hello");
  const Outcome outcome = vantrell({"id", "a.txt", "--verbose"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_EQ(outcome.out, identifierOf("a.txt") + "\n");
  EXPECT_THAT(outcome.err, AllOf(HasSubstr("[DEBUG] ┏"), HasSubstr("fetching item identifier")));
}

TEST_F(Commands, SuccessIsQuiet) {
  write("a.txt", "hello");
  EXPECT_EQ(vantrell({"ls"}).err, "");
  EXPECT_EQ(vantrell({"tag", "a.txt", "x"}).err, "");
}

TEST_F(Commands, AStorageWithoutADocumentsFolderOnItsPathGetsAWarning) {
  std::filesystem::create_directory(home() / "Papiere");
  std::ofstream(home() / "Papiere/a.txt") << "x";
  const std::string storage = home() / "Papiere";
  const Outcome outcome = vantrell({"--storage", storage, "ls"});
  EXPECT_EQ(outcome.status, 0);
  EXPECT_THAT(outcome.out, HasSubstr("a.txt\n"));
  EXPECT_THAT(outcome.err, AllOf(HasSubstr("warning"), HasSubstr("no trash")));
  const Outcome json = vantrell({"--storage", storage, "--json", "ls"});
  EXPECT_TRUE(Json::parse(json.err).contains("warning"));
}

TEST_F(Commands, AReaderWhoHasSeenEnoughIsNoError) {
  for (int i = 0; i < 3000; ++i) write("file" + std::to_string(i), "x");
  vantrell({"ls"});
  RunningProgram listing(invocation({"--json", "ls"}));
  std::array<char, 10> some;
  ASSERT_GT(::read(listing.output(), some.data(), some.size()), 0);
  listing.closeOutput();
  EXPECT_EQ(listing.wait(), 0);
}

TEST_F(Commands, OutputThatCannotBeWrittenIsAnError) {
  write("a.txt", "hello");
  Invocation full = invocation({"--json", "ls"});
  full.outputFile = "/dev/full";
  const Outcome outcome = run(full);
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(Json::parse(outcome.err)["name"], "ENOSPC");
}

TEST_F(Commands, AClosedOutputIsAnErrorAndNothingElseIsWrittenTo) {
  write("a.txt", "hello");
  const Words command = {"sh", "-c", "exec \"$0\" --json ls >&-", VANTRELL_PROGRAM};
  Invocation closed = invocation({});
  closed.words = command;
  const Outcome outcome = run(closed);
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(Json::parse(outcome.err)["name"], "EBADF");
  EXPECT_EQ(contentOf(stateFolder() / "lock"), "");
  EXPECT_EQ(vantrell({"ls"}).status, 0);
}

TEST_F(Commands, ADocumentsFolderOfAnotherNameIsFound) {
  std::filesystem::create_directory(home() / "config");
  std::ofstream(home() / "config/user-dirs.dirs") << "XDG_DOCUMENTS_DIR=\"$HOME/Papiere\"\n";
  std::filesystem::create_directory(home() / "Papiere");
  EXPECT_EQ(vantrell({"path", "root"}).out, (home() / "Papiere").native() + "\n");
}

}  // namespace
}  // namespace vantrell::integration
