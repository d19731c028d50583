#include "cli/Json.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "platform/dochost/DochostTags.h"
#include "tests/fakes/FakeItem.h"

namespace vantrell::cli {
namespace {

FakeItem fullItem() {
  FakeItem::Fields fields;
  fields.documentSize = 12;
  fields.creationDate = FndDate::fromUnixTime(0);
  fields.contentModificationDate = FndDate::fromUnixTime(1, 500000000);
  fields.childItemCount = 3;
  fields.versionIdentifier = FndData{1, 2, 3};
  fields.isTrashed = true;
  fields.lastUsedDate = FndDate::fromUnixTime(2);
  fields.tagData = dataFromDochostTags({{"Work", 4}, {"Rot", std::nullopt}}).value();
  fields.favoriteRank = 18446744073709551615U;
  fields.fileID = FileID{7};
  fields.docID = DocumentID{1};
  fields.lumenDomainIdentifier = "org.example";
  fields.appContainerBundleIdentifier = "org.example";
  fields.putBackURL = FndURL::fileURLWithPath("/storage/b c");
  return FakeItem(fields);
}

TEST(ItemRecord, EveryFieldHasItsNameAndForm) {
  EXPECT_EQ(lineOf(recordOfItem(fullItem())),
            R"({"itemIdentifier":"did=1",)"
            R"("parentItemIdentifier":"DochostRootContainerItemIdentifier",)"
            R"("filename":"a.txt","typeIdentifier":"text/plain","documentSize":12,)"
            R"("creationDate":"1970-01-01T00:00:00Z",)"
            R"("contentModificationDate":"1970-01-01T00:00:01.5Z","childItemCount":3,)"
            R"("capabilities":1,"versionIdentifier":"AQID","isTrashed":true,)"
            R"("lastUsedDate":"1970-01-01T00:00:02Z","tags":["Work","Rot"],)"
            R"("favoriteRank":18446744073709551615,"fileID":7,"docID":1,)"
            R"("fileURL":"file:///storage/a.txt","dh_lumenDomainIdentifier":"org.example",)"
            R"("dh_appContainerBundleIdentifier":"org.example","dh_isUbiquitous":false,)"
            R"("putBackURL":"file:///storage/b%20c"})"
            "\n");
}

TEST(ItemRecord, AbsentValuesAreLeftOut) {
  EXPECT_EQ(lineOf(recordOfItem(FakeItem({}))),
            R"({"itemIdentifier":"did=1",)"
            R"("parentItemIdentifier":"DochostRootContainerItemIdentifier",)"
            R"("filename":"a.txt","typeIdentifier":"text/plain","capabilities":1,)"
            R"("isTrashed":false,"fileURL":"file:///storage/a.txt","dh_isUbiquitous":false})"
            "\n");
}

TEST(ItemRecord, AnItemWithNoTagsLeftHasAnEmptyList) {
  FakeItem::Fields fields;
  fields.tagData = dataFromDochostTags({}).value();
  EXPECT_EQ(recordOfItem(FakeItem(fields))["tags"], Json::array());
}

TEST(ItemRecord, ANameThatIsNotUTF8StandsWholeInBase64) {
  FakeItem::Fields fields;
  fields.filename = "caf\xe9.txt";
  const std::string line = lineOf(recordOfItem(FakeItem(fields)));
  const Json record = Json::parse(line);
  EXPECT_EQ(record["filename"], "caf\xEF\xBF\xBD.txt");
  EXPECT_EQ(record["filenameBase64"], "Y2Fm6S50eHQ=");
}

TEST(Text, UTF8NeedsNoBase64) {
  for (const char* text : {"", "plain", "caf\xc3\xa9", "\xef\xbf\xbd", "tab\tand\nline"}) {
    Json object;
    putText(object, "path", text);
    EXPECT_FALSE(object.contains("pathBase64")) << text;
  }
}

TEST(ErrorRecord, APOSIXErrorHasItsName) {
  EXPECT_EQ(lineOf(recordOfError(FndError::posix(ENOSPC))),
            "{\"domain\":\"FndPOSIXErrorDomain\",\"code\":28,\"name\":\"ENOSPC\","
            "\"message\":\"No space left on device\"}\n");
}

TEST(ErrorRecord, AnErrorOfOursHasItsMessage) {
  EXPECT_EQ(lineOf(recordOfError(
                FndError::vantrell(VantrellErrorCode::StateUnavailable, "In use \xff."))),
            "{\"domain\":\"com.quillon.vantrell\",\"code\":9,"
            "\"message\":\"In use \xEF\xBF\xBD.\"}\n");
}

TEST(Table, FieldsAreAlignedAndNestedOnesNamed) {
  Json object;
  object["a"] = "one";
  object["outer"] = Json{{"inner", 2}, {"list", Json::array({"x", "y"})}};
  EXPECT_EQ(tableOf(object),
            "a            one\n"
            "outer.inner  2\n"
            "outer.list   x, y\n");
}

TEST(Table, ControlCharactersAndStrayBytesAreEscaped) {
  Json object;
  putText(object, "name", "\x1b[31m\xff");
  EXPECT_EQ(tableOf(object), "name  \\x1B[31m\\xFF\n");
}

}  // namespace
}  // namespace vantrell::cli
