// Reads docs/compatibility.md and the source tree: every anchor the code
// points to exists, every entry names its code and the tests that pin it,
// each file an entry names points back to it, and every test named exists.

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr char gc_Register[] = "docs/compatibility.md";
constexpr char gc_ManualPage[] = "man/quorvexPYLON_VPD_Survey_ClientPartition.8.in";
// Where code, build files and tests live; build trees lie outside them.
constexpr char const* gc_SourceFolders[] = {"src", "sim", "cmake", "tests", "fuzz", "bench", "man"};
// Production code lies here, beside its tests.
constexpr char const* gc_ProductionFolders[] = {"src", "sim"};

std::string u_path(std::string const& relative) {
    return std::string(QUORVEX_SOURCE_ROOT) + "/" + relative;
}

std::string u_read(std::string const& path) {
    std::ifstream file(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
}

bool u_is_SourceFile(fs::path const& path) {
    static std::set<std::string> const extensions{".cpp", ".h", ".in", ".cmake", ".txt"};
    return extensions.count(path.extension().string()) != 0;
}

bool u_is_TestFile(fs::path const& path) {
    std::string const name = path.filename().string();
    return name.find("_test.") != std::string::npos;
}

// Every source file under the given folders, relative to the root.
std::vector<std::string> u_list_SourceFiles(std::vector<std::string> const& folders) {
    std::vector<std::string> files;
    for (std::string const& folder : folders) {
        fs::path const root = u_path(folder);
        if (!fs::is_directory(root)) {
            continue;
        }
        for (auto const& entry : fs::recursive_directory_iterator(root)) {
            if (entry.is_regular_file() && u_is_SourceFile(entry.path())) {
                files.push_back(fs::relative(entry.path(), QUORVEX_SOURCE_ROOT).generic_string());
            }
        }
    }
    std::sort(files.begin(), files.end());
    return files;
}

std::vector<std::string> u_all_SourceFiles() {
    return u_list_SourceFiles({std::begin(gc_SourceFolders), std::end(gc_SourceFolders)});
}

// One entry of the register: its anchor and the text up to the next entry.
struct Entry {
    std::string anchor;
    std::string text;
};

std::vector<Entry> u_read_Entries() {
    std::string const text = u_read(u_path(gc_Register));
    std::regex const anchor("<a id=\"([a-z0-9-]+)\"></a>");
    std::vector<Entry> entries;
    for (std::sregex_iterator it(text.begin(), text.end(), anchor), end; it != end; ++it) {
        if (!entries.empty()) {
            std::string& previous = entries.back().text;
            previous.erase(previous.size() -
                           (text.size() - static_cast<std::size_t>(it->position())));
        }
        entries.push_back({(*it)[1].str(), text.substr(static_cast<std::size_t>(it->position()))});
    }
    return entries;
}

// The text of the field "- **<name>:**" of an entry with its continuation
// lines (those indented by two blanks); empty when the field is missing.
std::string u_get_Field(Entry const& entry, std::string const& name) {
    std::string const start = "- **" + name + ":**";
    std::size_t const at = entry.text.find(start);
    if (at == std::string::npos) {
        return "";
    }
    std::istringstream lines(entry.text.substr(at + start.size()));
    std::string field;
    std::string line;
    std::getline(lines, field);
    while (std::getline(lines, line) && line.rfind("  ", 0) == 0) {
        field += " " + line;
    }
    return field;
}

// The first group of every match of pattern in text.
std::vector<std::string> u_get_Captures(std::string const& text, std::regex const& pattern) {
    std::vector<std::string> captures;
    for (std::sregex_iterator it(text.begin(), text.end(), pattern), end; it != end; ++it) {
        captures.push_back((*it)[1].str());
    }
    return captures;
}

// The texts between backticks.
std::vector<std::string> u_get_Quoted(std::string const& text) {
    return u_get_Captures(text, std::regex("`([^`]+)`"));
}

bool u_is_TestName(std::string const& text) {
    static std::regex const testName("[A-Za-z0-9_]+\\.[A-Za-z0-9_]+");
    return std::regex_match(text, testName);
}

std::string u_without_Blanks(std::string text) {
    text.erase(std::remove_if(text.begin(), text.end(),
                              [](unsigned char c) { return std::isspace(c) != 0; }),
               text.end());
    return text;
}

// "Suite.Test" of every test defined in the tree, from its definition.
std::set<std::string> u_defined_Tests() {
    std::regex const definition("TEST(?:_F|_P)?\\(([A-Za-z0-9_]+),([A-Za-z0-9_]+)\\)");
    std::set<std::string> tests;
    for (std::string const& file : u_all_SourceFiles()) {
        std::string const text = u_without_Blanks(u_read(u_path(file)));
        for (std::sregex_iterator it(text.begin(), text.end(), definition), end; it != end; ++it) {
            tests.insert((*it)[1].str() + "." + (*it)[2].str());
        }
    }
    return tests;
}

std::set<std::string> u_anchors(std::vector<Entry> const& entries) {
    std::set<std::string> anchors;
    for (Entry const& entry : entries) {
        anchors.insert(entry.anchor);
    }
    return anchors;
}

// The anchors of the register that a text points to.
std::vector<std::string> u_pointed_Anchors(std::string const& text) {
    return u_get_Captures(text, std::regex("docs/compatibility\\.md#([a-z0-9-]+)"));
}

TEST(CompatibilityRegister, HasEntriesWithDistinctAnchors) {
    std::vector<Entry> const entries = u_read_Entries();
    EXPECT_GE(entries.size(), 40u);
    EXPECT_EQ(u_anchors(entries).size(), entries.size());
}

TEST(CompatibilityRegister, EveryAnchorTheCodePointsToExists) {
    std::set<std::string> const anchors = u_anchors(u_read_Entries());
    std::size_t pointers = 0;
    for (std::string const& file : u_all_SourceFiles()) {
        for (std::string const& anchor : u_pointed_Anchors(u_read(u_path(file)))) {
            ++pointers;
            EXPECT_EQ(anchors.count(anchor), 1u) << file << " points to #" << anchor;
        }
    }
    EXPECT_GT(pointers, 0u);
}

TEST(CompatibilityRegister, EveryEntryNamesItsCodeAndAPinningTest) {
    for (Entry const& entry : u_read_Entries()) {
        EXPECT_FALSE(u_get_Field(entry, "What").empty()) << entry.anchor;
        EXPECT_FALSE(u_get_Field(entry, "Bytes").empty()) << entry.anchor;
        EXPECT_FALSE(u_get_Field(entry, "Who depends").empty()) << entry.anchor;
        EXPECT_FALSE(u_get_Quoted(u_get_Field(entry, "Code")).empty()) << entry.anchor;
        std::vector<std::string> const pinning = u_get_Quoted(u_get_Field(entry, "Pinned by"));
        EXPECT_TRUE(std::any_of(pinning.begin(), pinning.end(), u_is_TestName)) << entry.anchor;
    }
}

TEST(CompatibilityRegister, EveryFileNamedUnderCodePointsBackToItsEntry) {
    for (Entry const& entry : u_read_Entries()) {
        for (std::string const& file : u_get_Quoted(u_get_Field(entry, "Code"))) {
            ASSERT_TRUE(fs::is_regular_file(u_path(file))) << entry.anchor << ": " << file;
            std::vector<std::string> const anchors = u_pointed_Anchors(u_read(u_path(file)));
            EXPECT_TRUE(std::find(anchors.begin(), anchors.end(), entry.anchor) != anchors.end())
                << file << " does not point to #" << entry.anchor;
        }
    }
}

TEST(CompatibilityRegister, EveryTestNamedInTheRegisterExists) {
    std::set<std::string> const tests = u_defined_Tests();
    ASSERT_GT(tests.size(), 100u);
    for (Entry const& entry : u_read_Entries()) {
        for (std::string const& name : u_get_Quoted(u_get_Field(entry, "Pinned by"))) {
            if (u_is_TestName(name)) {
                EXPECT_EQ(tests.count(name), 1u) << entry.anchor << ": " << name;
            }
        }
    }
}

std::vector<std::string> u_read_Lines(std::string const& path) {
    std::istringstream text(u_read(path));
    std::vector<std::string> lines;
    for (std::string line; std::getline(text, line);) {
        lines.push_back(line);
    }
    return lines;
}

bool u_says_Deliberate(std::string line) {
    std::transform(line.begin(), line.end(), line.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return line.find("deliberate") != std::string::npos;
}

// A comment that calls something deliberate says for whom, through the
// register, on its line or on one of the two after it.
TEST(CompatibilityRegister, EveryDeliberatelyInProductionCodePointsToTheRegister) {
    for (std::string const& file :
         u_list_SourceFiles({std::begin(gc_ProductionFolders), std::end(gc_ProductionFolders)})) {
        if (u_is_TestFile(file)) {
            continue;
        }
        std::vector<std::string> const lines = u_read_Lines(u_path(file));
        for (std::size_t i = 0; i < lines.size(); ++i) {
            if (!u_says_Deliberate(lines[i])) {
                continue;
            }
            std::string nearby;
            for (std::size_t j = i; j < lines.size() && j < i + 3; ++j) {
                nearby += lines[j];
            }
            EXPECT_FALSE(u_pointed_Anchors(nearby).empty()) << file << ":" << i + 1;
        }
    }
}

TEST(CompatibilityRegister, ManualPageNotesTheKeptBehavioursAnOperatorMeets) {
    std::string const page = u_read(u_path(gc_ManualPage));
    std::size_t const notes = page.find("\n.SH NOTES\n");
    ASSERT_NE(notes, std::string::npos);
    std::string const section = page.substr(notes, page.find("\n.SH ", notes + 1) - notes);
    for (char const* text : {"escaped", "4294967295", "3et result Failed, rc = ", "signal", "trust",
                             "docs/compatibility.md"}) {
        EXPECT_NE(section.find(text), std::string::npos) << text;
    }
}

} // namespace
