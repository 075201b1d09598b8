#include "inventory/StrayMarkup.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>

namespace {

using inventory::escapeStrayMarkup;

constexpr char gc_Document[] =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">\n"
    "   <Resource displayName=\"p\" uniqueId=\"u\">\n"
    "      p\n"
    "      <Property displayName=\"Serial Number\" name=\"SN\">\n"
    "         SN\n"
    "         <Value type=\"string\">Y050</Value>\n"
    "      </Property>\n"
    "   </Resource>\n"
    "</com.zor.inventory>";

TEST(InventoryStrayMarkup, DocumentWithoutMarkupInValuesIsUnchanged) {
    EXPECT_EQ(gc_Document, escapeStrayMarkup(gc_Document));
}

TEST(InventoryStrayMarkup, EveryAmpersandIsEscaped) {
    EXPECT_EQ("<Value type=\"string\">a&amp;b &amp;amp;</Value>\n",
              escapeStrayMarkup("<Value type=\"string\">a&b &amp;</Value>\n"));
}

TEST(InventoryStrayMarkup, ValueTextIsEscapedUpToItsEndTag) {
    EXPECT_EQ("<Value type=\"string\">&lt;host2&gt; &lt;/Value&gt;x</Value>\n</Property>",
              escapeStrayMarkup("<Value type=\"string\"><host2> </Value>x</Value>\n</Property>"));
}

TEST(InventoryStrayMarkup, QuoteInsideAnAttributeValueIsEscaped) {
    EXPECT_EQ("<Resource displayName=\"a&amp;b&lt;c&quot;d\" uniqueId=\"u\">\n",
              escapeStrayMarkup("<Resource displayName=\"a&b<c\"d\" uniqueId=\"u\">\n"));
}

TEST(InventoryStrayMarkup, LessThanThatStartsNoElementOfTheDocumentIsText) {
    EXPECT_EQ("<Resource displayName=\"r\">\n&lt;r&gt;\n&lt;!DOCTYPE x&gt;&lt;&gt;&lt;/&gt;\n",
              escapeStrayMarkup("<Resource displayName=\"r\">\n<r>\n<!DOCTYPE x><></>\n"));
}

TEST(InventoryStrayMarkup, DeclarationIsMarkupOnlyAtTheStart) {
    EXPECT_EQ("\n&lt;?xml version=&quot;1.0&quot;?&gt;",
              escapeStrayMarkup("\n<?xml version=\"1.0\"?>"));
}

TEST(InventoryStrayMarkup, TagCutShortLeavesTheRestAsText) {
    EXPECT_EQ("<Resource displayName=&quot;a", escapeStrayMarkup("<Resource displayName=\"a"));
}

TEST(InventoryStrayMarkup, LineEndsAreKept) {
    std::string const text = "<Value type=\"string\">a\n<b>\r\n&</Value>\n</Property>\n";
    std::string const escaped = escapeStrayMarkup(text);
    EXPECT_EQ(std::count(text.begin(), text.end(), '\n'),
              std::count(escaped.begin(), escaped.end(), '\n'));
    EXPECT_EQ(std::count(text.begin(), text.end(), '\r'),
              std::count(escaped.begin(), escaped.end(), '\r'));
}

} // namespace
