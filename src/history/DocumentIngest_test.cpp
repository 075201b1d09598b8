#include "history/DocumentIngest.h"

#include "QuorvexTest.h"
#include "history/ContentHash.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

namespace {

using history::DocumentIngest;
using history::DocumentIngestResult;

std::vector<std::string> writtenDocuments(QuorvexTest::TemporaryDirectory const& folder,
                                          int count) {
    std::vector<std::string> paths;
    for (int index = 0; index < count; ++index) {
        paths.push_back(folder.file(std::to_string(index) + ".VPD.xml"));
        QuorvexTest::writeFile(paths.back(), "not xml " + std::to_string(index));
    }
    return paths;
}

TEST(HistoryDocumentIngest, EveryDocumentIsDeliveredOnceWithItsOwnHash) {
    QuorvexTest::TemporaryDirectory const folder;
    std::vector<std::string> const paths = writtenDocuments(folder, 1000);
    history::KnownDocuments const known;
    std::vector<int> deliveries(paths.size());
    DocumentIngest(known, 2).run(paths, [&](std::size_t index, DocumentIngestResult&& result) {
        ++deliveries.at(index);
        EXPECT_EQ(history::contentHash("not xml " + std::to_string(index)), result.hash);
        ASSERT_TRUE(result.reading);
        EXPECT_EQ("unreadable", result.reading->inventory);
    });
    EXPECT_EQ(std::vector<int>(paths.size(), 1), deliveries);
}

TEST(HistoryDocumentIngest, KnownContentIsNotRead) {
    QuorvexTest::TemporaryDirectory const folder;
    std::vector<std::string> const paths = writtenDocuments(folder, 1);
    history::KnownDocuments known;
    known.add(history::contentHash("not xml 0"), {"unreadable", "document unreadable at line 1"});
    DocumentIngestResult const result = DocumentIngest(known, 1).ingest(paths[0]);
    EXPECT_FALSE(result.reading);
    EXPECT_EQ(history::contentHash("not xml 0"), result.hash);
    ASSERT_NE(nullptr, result.known);
    EXPECT_EQ("unreadable", result.known->inventory);
    EXPECT_EQ("document unreadable at line 1", result.known->problem);
}

TEST(HistoryDocumentIngest, FileThatCannotBeReadSaysWhy) {
    QuorvexTest::TemporaryDirectory const folder;
    history::KnownDocuments const known;
    DocumentIngestResult const result = DocumentIngest(known, 1).ingest(folder.path());
    EXPECT_EQ("", result.hash);
    EXPECT_EQ("cannot read " + folder.path() + ": Is a directory", result.readFailure);
}

TEST(HistoryDocumentIngest, FailureWhileDeliveringStopsTheReadersAndIsThrown) {
    QuorvexTest::TemporaryDirectory const folder;
    std::vector<std::string> const paths = writtenDocuments(folder, 1000);
    history::KnownDocuments const known;
    std::size_t delivered = 0;
    EXPECT_THROW(DocumentIngest(known, 2).run(paths,
                                              [&](std::size_t, DocumentIngestResult&&) {
                                                  if (++delivered == 10) {
                                                      throw std::runtime_error("disk full");
                                                  }
                                              }),
                 std::runtime_error);
    EXPECT_EQ(10u, delivered);
}

} // namespace
