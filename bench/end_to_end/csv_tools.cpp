// Helpers of the end-to-end CSV rows of bench/run:
//   csv_tools generate MEGABYTES PATH   a CSV of 10 cells a line: 10% empty, 40% integers,
//                                       50% short words (the same bytes every time)
//   csv_tools generate-rfc4180 ...      the same, one cell in ten quoted with a comma in it
//   csv_tools generate-json ...         the same cells as an array of JSON records
//   csv_tools split PATH                the loader a competent engineer writes in an
//                                       afternoon: every cell into a std::string
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <iterator>
#include <random>
#include <string>
#include <vector>

namespace {

// The same cells in three shapes: plain CSV; RFC 4180 CSV, where one cell in ten is a
// word quoted with a comma in it; and JSON, an array of records named c1..c10 (empty cells
// as "").
enum class Shape { Csv, Rfc4180, Json };

int generate(Shape shape, long megabytes, const char* path) {
  std::ofstream out(path, std::ios::binary);
  if (!out) return 1;
  std::mt19937 random(20261124);
  static const char* const words[] = {"alpha",   "bravo", "charlie", "delta", "echo",
                                      "foxtrot", "golf",  "hotel",   "india", "juliet"};
  const long long target = megabytes * 1000000LL;
  const bool json = shape == Shape::Json;
  long long written = 0;
  std::string line;
  if (json) out << "[\n";
  while (written < target) {
    line.clear();
    if (json) line += written > 0 ? ",\n{" : "{";
    for (int cell = 0; cell < 10; ++cell) {
      if (cell > 0) line += json ? ", " : ",";
      if (json) line += "\"c" + std::to_string(cell + 1) + "\": ";
      const unsigned kind = random() % 10;
      if (kind == 0) {
        if (json) line += "\"\"";
      } else if (kind <= 4) {
        line += std::to_string(static_cast<int32_t>(random() % 2000001) - 1000000);
      } else {
        const std::string word = words[random() % 10];
        const std::string number = std::to_string(random() % 100);
        if (json) {
          line += "\"" + word + number + "\"";
        } else if (shape == Shape::Rfc4180 && kind == 9) {
          line += "\"" + word + ", " + number + "\"";
        } else {
          line += word + number;
        }
      }
    }
    line += json ? "}" : "\r\n";
    out << line;
    written += static_cast<long long>(line.size());
  }
  if (json) out << "\n]\n";
  return out ? 0 : 1;
}

int split(const char* path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return 1;
  const std::string bytes((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  std::vector<std::vector<std::string>> rows;
  std::vector<std::string> row;
  std::string cell;
  for (char c : bytes) {
    if (c == ',') {
      row.push_back(std::move(cell));
      cell.clear();
    } else if (c == '\n') {
      row.push_back(std::move(cell));
      cell.clear();
      rows.push_back(std::move(row));
      row.clear();
    } else if (c != '\r') {
      cell += c;
    }
  }
  size_t cells = 0;
  for (const auto& r : rows) cells += r.size();
  std::printf("%zu cells\n", cells);
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  const std::string mode = argc > 1 ? argv[1] : "";
  if (mode == "generate" && argc == 4) return generate(Shape::Csv, std::atol(argv[2]), argv[3]);
  if (mode == "generate-rfc4180" && argc == 4) {
    return generate(Shape::Rfc4180, std::atol(argv[2]), argv[3]);
  }
  if (mode == "generate-json" && argc == 4) {
    return generate(Shape::Json, std::atol(argv[2]), argv[3]);
  }
  if (mode == "split" && argc == 3) return split(argv[2]);
  std::cerr << "usage: csv_tools generate[-rfc4180|-json] MEGABYTES PATH | split PATH\n";
  return 2;
}
