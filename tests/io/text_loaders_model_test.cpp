// The CSV and INI loaders against plain models of their rules, on random texts long
// enough that lines and cells cross the loaders' 8- and 16-byte scan blocks.
#include <random>
#include <string>
#include <vector>

#include "io/csv_file.h"
#include "io/ini_file.h"
#include "io_test_support.h"

namespace quorrel {
namespace {

class TextLoaders : public IoTest {};

std::string randomText(std::mt19937& random, std::string_view alphabet) {
  std::string text(random() % 120, ' ');
  for (char& c : text) c = alphabet[random() % alphabet.size()];
  return text;
}

// Lines are the runs of characters between CR and LF; each line's cells are split at
// commas, a cell of two double quotes is empty, and short lines are padded to the
// widest. Returns the width, and the cells joined as contents() joins them.
std::pair<int32_t, std::string> csvModel(const std::string& text) {
  std::vector<std::vector<std::string>> lines;
  std::string line;
  const auto endLine = [&] {
    if (line.empty()) return;
    std::vector<std::string>& cells = lines.emplace_back(1);
    for (char c : line) {
      if (c == ',') {
        cells.emplace_back();
      } else {
        cells.back().push_back(c);
      }
    }
    for (std::string& cell : cells) cell = cell == "\"\"" ? "" : cell;
    line.clear();
  };
  for (char c : text) c == '\r' || c == '\n' ? endLine() : line.push_back(c);
  endLine();
  size_t width = 0;
  for (const auto& cells : lines) width = std::max(width, cells.size());
  std::string joined;
  bool first = true;
  for (const auto& cells : lines) {
    for (size_t j = 0; j < width; ++j) {
      joined += first ? "" : "|";
      first = false;
      if (j < cells.size()) joined += cells[j];
    }
  }
  return {static_cast<int32_t>(width), joined};
}

// Entries of every section in order: a line of two or more characters that starts
// (after blanks) with "[" and has a "]" later opens a section; "//" lines and entry
// lines before the first section are skipped; the first "=" splits key and value, and
// a line without one has no value ("~"). Joined as entriesOf() joins them.
std::string iniModel(const std::string& text) {
  std::string joined, line;
  bool inSection = false, first = true;
  const auto endLine = [&] {
    const std::string l = line;
    line.clear();
    if (l.size() <= 1) return;
    const size_t p = l.find_first_not_of(" \t");
    const std::string rest = p == std::string::npos ? "" : l.substr(p);
    if (!rest.empty() && rest[0] == '[') {
      if (rest.find(']', 1) != std::string::npos) inSection = true;
      return;
    }
    if (rest.starts_with("//") || !inSection) return;
    const size_t equals = rest.find('=');
    joined += (first ? "" : "|") + (equals == std::string::npos ? rest + "=~" : rest);
    first = false;
  };
  for (char c : text) c == '\r' || c == '\n' ? endLine() : line.push_back(c);
  endLine();
  return joined;
}

TEST_F(TextLoaders, AgreeWithTheirModelsOnRandomTexts) {
  std::mt19937 random(21);
  for (int round = 0; round < 400; ++round) {
    const std::string csv = randomText(random, "ab,,,\r\n\"  xyz");
    SCOPED_TRACE(csv);
    ElementArray table = loaded(loadCsvFile, csv);
    const auto [width, cells] = csvModel(csv);
    EXPECT_EQ(table.dimensions(), 2);
    EXPECT_EQ(table.boundary(1), width);
    EXPECT_EQ(contents(table), cells);

    const std::string ini = "[s]\n" + randomText(random, "ab==[]//  \r\n\nkv");
    SCOPED_TRACE(ini);
    ElementArray entries = loaded(loadIniFile, ini);
    EXPECT_EQ(entriesOf(entries), iniModel(ini));
  }
}

}  // namespace
}  // namespace quorrel
