// The pages for --html as files: what they are made from, and how they come to their place. What a
// browser makes of them is tested in tests/browser.

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Files.h"
#include "HtmlPage.h"
#include "HtmlReport.h"
#include "ToolRun.h"

namespace {

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }

std::size_t countOf(const std::string& text, const std::string& part) {
  std::size_t count = 0;
  for (std::size_t place = 0; (place = text.find(part, place)) != std::string::npos; ++place) {
    ++count;
  }
  return count;
}

bool has(const std::string& text, const std::string& part) {
  return text.find(part) != std::string::npos;
}

class Html : public ::testing::Test {
 protected:
  Html() {
    m_folder.install(
        "old", {{"V3.user.at", at("1.1 NAME 'a' DESC 'd' SINGLE-VALUE") + at("1.2 NAME 'b' SUP a") +
                                   at("1.3 NAME 'same' DESC 'x'")},
                {"V3.user.oc", "objectclasses=( 2.1 NAME 'c' MAY ( a $ b ) )\n"}});
    m_folder.install(
        "new", {{"V3.user.at", at("1.1 NAME 'a' DESC 'd'") + at("1.3 NAME 'same' DESC 'x'")}});
  }

  ToolResult run(const std::string& command, std::vector<std::string> more = {},
                 const std::function<void()>& prepare = nullptr) const {
    std::vector<std::string> arguments = {command};
    if (command == "check") {
      arguments.emplace_back("@/old");
    } else {
      arguments.insert(arguments.end(), {"--from", "@/old", "--to", "@/new"});
    }
    arguments.insert(arguments.end(), more.begin(), more.end());
    return m_folder.run(arguments, prepare);
  }
  std::string page(const std::string& name = "page.html") const {
    return support::readWholeFile(m_folder.file(name));
  }

  ToolFolder m_folder;
};

TEST_F(Html, ThePageHasEachDefinitionOfTheDocument) {
  for (const char* const command : {"diff", "plan"}) {
    SCOPED_TRACE(command);
    const ToolResult result = run(command, {"--format", "json", "--html", "@/page.html"});
    const auto document = nlohmann::json::parse(result.out);
    const std::string text = page();
    EXPECT_EQ(document["definitions"].size(), countOf(text, "class=\"item "));
    for (std::size_t i = 0; i < document["definitions"].size(); ++i) {
      EXPECT_EQ(1U, countOf(text, " id=\"d" + std::to_string(i) + "\"")) << i;
    }
    EXPECT_TRUE(has(text, "must not go ahead: 1 definition undecided.")) << text;
    EXPECT_TRUE(has(text, "NAME &#39;a&#39;")) << text;
  }
}

TEST_F(Html, ThePageDoesNotChangeWhatIsPrinted) {
  for (const char* const command : {"check", "diff", "plan"}) {
    const ToolResult with = run(command, {"--html", "@/page.html"});
    const ToolResult without = run(command);
    EXPECT_EQ(without.out, with.out) << command;
    EXPECT_EQ(without.err, with.err) << command;
    EXPECT_EQ(without.exitCode, with.exitCode) << command;
    EXPECT_TRUE(has(page(), "</html>")) << command;
  }
}

TEST_F(Html, MigrateTellsItsPlan) {
  const ToolResult refused = run("migrate", {"--out", "@/out", "--html", "@/page.html"});
  EXPECT_EQ(4, refused.exitCode);
  EXPECT_TRUE(has(page(), "<title>Migration"));
  EXPECT_TRUE(has(page(), "must not go ahead: 1 definition undecided."));
  const ToolResult done =
      run("migrate", {"--out", "@/out", "--prefer", "old", "--html", "@/page.html"});
  EXPECT_EQ(0, done.exitCode) << done.err;
  EXPECT_TRUE(has(page(), "The migration may go ahead"));
  EXPECT_EQ("new old out page.html", m_folder.names());
}

TEST_F(Html, NothingIsMigratedWithoutThePage) {
  m_folder.write("mine", "mine");
  EXPECT_EQ(5, run("migrate", {"--out", "@/out", "--prefer", "old", "--html", "@/mine"}).exitCode);
  EXPECT_EQ("mine new old", m_folder.names());
}

TEST_F(Html, TheSameRunGivesTheSamePage) {
  run("plan", {"--html", "@/page.html"});
  run("plan", {"--html", "@/again.html"});
  EXPECT_EQ(page(), page("again.html"));
}

TEST_F(Html, WhatIsUndecidedComesFirst) {
  run("plan", {"--html", "@/page.html"});
  const std::string text = page();
  const std::size_t undecided = text.find("<h2 id=\"undecided-heading\">Undecided");
  const std::size_t rest = text.find("<h2 id=\"rest-heading\">Decided");
  const std::size_t conflict = text.find("<b>a</b> (1.1)");
  const std::size_t added = text.find("<b>b</b> (1.2)");
  EXPECT_LT(text.find("must not go ahead"), undecided);
  EXPECT_LT(undecided, conflict);
  EXPECT_LT(conflict, rest);
  EXPECT_LT(rest, added);
}

TEST_F(Html, ANameLeadsToItsDefinition) {
  const ToolResult result = run("plan", {"--format", "json", "--html", "@/page.html"});
  const auto document = nlohmann::json::parse(result.out);
  std::string target;
  for (std::size_t i = 0; i < document["definitions"].size(); ++i) {
    if (document["definitions"][i]["name"] == "b") {
      target = std::to_string(i);
    }
  }
  EXPECT_TRUE(has(page(), "MAY <a href=\"#d0\">a</a> $ <a href=\"#d" + target + "\">b</a>"))
      << page();
}

// ---- Hostile texts ----

const char* const kHostile[] = {"</script><script>alert(1)</script>",
                                "</style></title><img src=x onerror=alert(1)>",
                                "\"> <svg onload=alert(1)>",
                                "' onmouseover='alert(1)",
                                "javascript:alert(1)",
                                "{{TITLE}}",
                                "&lt;b&gt;",
                                "<!--",
                                "\x1b]0;title\x07",
                                "a\xe2\x80\xa8z",
                                "a\xe2\x80\xae z",
                                "a\xc2\x9bz"};

void expectHarmless(const std::string& text) {
  EXPECT_EQ(1U, countOf(text, "<script"));
  EXPECT_EQ(1U, countOf(text, "</script"));
  EXPECT_EQ(1U, countOf(text, "</style"));
  EXPECT_EQ(0U, countOf(text, "<img"));
  EXPECT_EQ(0U, countOf(text, "<svg onload"));
  EXPECT_EQ(0U, countOf(text, "<!--"));
  EXPECT_EQ(0U, countOf(text, "href=\"javascript"));
  EXPECT_EQ(0U, countOf(text, "' onmouseover"));
  for (const char c : text) {
    EXPECT_TRUE(c == '\n' || static_cast<unsigned char>(c) >= ' ') << static_cast<int>(c);
  }
  for (const char* const unseen : {"\xe2\x80\xa8", "\xe2\x80\xae", "\xc2\x9b", "\x7f"}) {
    EXPECT_EQ(0U, countOf(text, unseen));
  }
}

// Every text in it becomes `hostile`.
void spoil(const std::string& hostile, nlohmann::ordered_json* json) {
  if (json->is_string()) {
    *json = hostile;
  } else if (json->is_structured()) {
    for (auto& member : *json) {
      spoil(hostile, &member);
    }
  }
}

TEST_F(Html, NoTextOfADocumentIsMoreThanText) {
  m_folder.write("excluded", "1.2\n");
  const std::string plan = run("plan", {"--format", "json", "--exclude-oids", "@/excluded"}).out;
  const std::string check = run("check", {"--format", "json"}).out;
  for (const char* const hostile : kHostile) {
    SCOPED_TRACE(hostile);
    for (const bool isPlan : {true, false}) {
      auto document = nlohmann::ordered_json::parse(isPlan ? plan : check);
      spoil(hostile, &document);
      expectHarmless(isPlan ? renderPlanHtml(document.dump()) : renderCheckHtml(document.dump()));
    }
  }
}

TEST_F(Html, WhatNobodySeesIsShown) {
  auto document = nlohmann::ordered_json::parse(run("plan", {"--format", "json"}).out);
  document["definitions"][0]["reason"] =
      "\x1b[31m \x7f \xe2\x80\xa8 \xe2\x80\xae \xc2\x9b \xc3\xa9";
  EXPECT_TRUE(
      has(renderPlanHtml(document.dump()), "\\u001b[31m \\u007f \\u2028 \\u202e \\u009b \xc3\xa9"));
}

std::string utf8Of(unsigned character) {
  std::string text;
  const auto follow = [&](unsigned shift) {
    text += static_cast<char>(0x80U | ((character >> shift) & 0x3fU));
  };
  if (character < 0x80) {
    text += static_cast<char>(character);
  } else if (character < 0x800) {
    text += static_cast<char>(0xc0U | (character >> 6U));
    follow(0);
  } else if (character < 0x10000) {
    text += static_cast<char>(0xe0U | (character >> 12U));
    follow(6);
    follow(0);
  } else {
    text += static_cast<char>(0xf0U | (character >> 18U));
    follow(12);
    follow(6);
    follow(0);
  }
  return text;
}

// Every character from one whose neighbours are seen to another.
TEST(HtmlText, EveryCharacterThatNobodySeesIsShown) {
  const std::vector<std::pair<unsigned, unsigned>> unseen = {
      {0, 0x1f},        {0x7f, 0x9f},     {0xad, 0xad},     {0x61c, 0x61c},
      {0x180e, 0x180e}, {0x200b, 0x200f}, {0x2028, 0x202e}, {0x2060, 0x206f},
      {0xfe00, 0xfe0f}, {0xfeff, 0xfeff}, {0xfff9, 0xfffb}, {0xe0000, 0xe0fff}};
  std::string shown;
  for (const auto& [first, last] : unseen) {
    for (unsigned character = first == 0 ? 0 : first - 1; character <= last + 1; ++character) {
      const std::string text = utf8Of(character);
      const bool isSeen = character < first || character > last;
      shown += (html::visible(text) == text) == isSeen ? "" : std::to_string(character) + " ";
    }
  }
  EXPECT_EQ("", shown);
  EXPECT_EQ("a\\u200b\\u202eb\\ufe0f\\ue0001", html::visible("a\xe2\x80\x8b\xe2\x80\xae"
                                                             "b\xef\xb8\x8f\xf3\xa0\x80\x81"));
}

TEST_F(Html, NoTextOfADefinitionIsMoreThanText) {
  std::string old;
  std::string latest;
  for (std::size_t i = 0; i < 8; ++i) {
    const std::string oid = "1." + std::to_string(i + 1);
    std::string text = kHostile[i];
    // No text in quotes has them.
    std::replace(text.begin(), text.end(), '\'', '"');
    old += at(oid + " NAME 'n" + oid + "' DESC '" + text + "' USAGE userApplications");
    latest += at(oid + " NAME 'n" + oid + "' DESC '" + text + "!' USAGE userApplications");
  }
  m_folder.install("<img src=x onerror=alert(2)>", {{"V3.user.at", old}});
  m_folder.install("\xff\x1b[31m\xe2\x80\xa8<script>", {{"V3.user.at", latest}});
  const ToolResult result =
      m_folder.run({"diff", "--from", "@/<img src=x onerror=alert(2)>", "--to",
                    "@/\xff\x1b[31m\xe2\x80\xa8<script>", "--html", "@/page.html"});
  EXPECT_EQ(1, result.exitCode) << result.err;
  expectHarmless(page());
  EXPECT_TRUE(has(page(), "{{TITLE}}"));
  EXPECT_TRUE(has(page(), "&amp;lt;b&amp;gt;!"));
  EXPECT_TRUE(has(page(), "&lt;img src=x onerror=alert(2)&gt;"));
  EXPECT_TRUE(has(page(), "\xef\xbf\xbd\\u001b[31m\\u2028&lt;script&gt;"));
}

TEST_F(Html, NoTextOfAFindingIsMoreThanText) {
  m_folder.install("old", {{"V3.user.at", at("1.1 NAME 'a' DESC '<img src=x>' X-A <script>") +
                                              "# \xff\x1b </script><script>alert(1)\n"}});
  run("check", {"--html", "@/page.html"});
  const std::string text = page();
  EXPECT_TRUE(has(text, "class=\"source\"")) << text;
  EXPECT_TRUE(has(text, "&lt;script&gt;")) << text;
  EXPECT_TRUE(has(text, "\xef\xbf\xbd\\u001b")) << text;
  expectHarmless(text);
}

// ---- The file ----

TEST_F(Html, APageOfBeforeIsReplaced) {
  EXPECT_EQ(4, run("plan", {"--html", "@/page.html"}).exitCode);
  ASSERT_EQ(0, ::chmod(m_folder.file("page.html").c_str(), 0640));
  EXPECT_EQ(0, run("check", {"--html", "@/page.html"}).exitCode);
  EXPECT_TRUE(has(page(), "<title>Findings"));
  struct stat status {};
  ASSERT_EQ(0, ::stat(m_folder.file("page.html").c_str(), &status));
  EXPECT_EQ(0640U, status.st_mode & 07777);
  EXPECT_EQ("new old page.html", m_folder.names());
}

TEST_F(Html, AnyOtherFileIsLeftAlone) {
  m_folder.write("decisions.toml", "# mine\n");
  const ToolResult result = run("plan", {"--html", "@/decisions.toml"});
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(
      "@/decisions.toml: error: is there and is no report of this program; name another file, or "
      "remove it\n",
      result.err);
  EXPECT_EQ("# mine\n", page("decisions.toml"));
}

TEST_F(Html, AnEmptyFileIsFilled) {
  m_folder.write("page.html", "");
  EXPECT_EQ(0, run("check", {"--html", "@/page.html"}).exitCode);
  EXPECT_TRUE(has(page(), "</html>"));
}

TEST_F(Html, NothingIsWrittenThroughASymbolicLink) {
  for (const char* const target : {"there", "nowhere"}) {
    m_folder.write("there", "");
    ::unlink(m_folder.file("link").c_str());
    ASSERT_EQ(0, ::symlink(target, m_folder.file("link").c_str()));
    const ToolResult result = run("check", {"--html", "@/link"});
    EXPECT_EQ(5, result.exitCode);
    EXPECT_EQ("@/link: error: is a symbolic link, which is not followed; name the file itself\n",
              result.err);
    EXPECT_EQ("", page("there"));
    EXPECT_EQ("link new old there", m_folder.names());
  }
}

TEST_F(Html, WhatIsNoFileIsRefused) {
  ASSERT_EQ(0, ::mkdir(m_folder.file("directory").c_str(), 0700));
  ASSERT_EQ(0, ::mkfifo(m_folder.file("pipe").c_str(), 0600));
  EXPECT_EQ("@/directory: error: is no regular file; name another one\n",
            run("check", {"--html", "@/directory"}).err);
  EXPECT_EQ("@/pipe: error: is no regular file; name another one\n",
            run("check", {"--html", "@/pipe"}).err);
  EXPECT_EQ("@/directory/: error: is no name of a file\n",
            run("check", {"--html", "@/directory/"}).err);
  const ToolResult missing = run("check", {"--html", "@/missing/page.html"});
  EXPECT_EQ(5, missing.exitCode);
  EXPECT_EQ(
      "@/missing/page.html: error: the directory to write it in cannot be used: No such file or "
      "directory\n",
      missing.err);
}

TEST_F(Html, APageThatCannotBeWrittenLeavesTheOneOfBefore) {
  run("check", {"--html", "@/page.html"});
  const std::string before = page();
  const ToolResult result = run("plan", {"--html", "@/page.html"}, [] {
    const struct rlimit limit = {1000, 1000};
    ::setrlimit(RLIMIT_FSIZE, &limit);
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ("@/page.html: error: cannot be written: File too large\n", result.err);
  EXPECT_EQ(before, page());
  EXPECT_EQ("new old page.html", m_folder.names());
}

}  // namespace
