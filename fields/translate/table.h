// A memory of the path: what each character becomes, for pages in which that is always the same.
#pragma once

#include "translate/path.h"
#include "translate/row.h"

#include <bitset>
#include <cstdlib>
#include <memory>
#include <string_view>

namespace zelfields {

template <bool shifts>
class Output;

// Rows by the code of a character of the source page: its byte or two bytes, or its code point. The
// path teaches a row when its character first occurs, so that the two cannot disagree. What has no
// row - bytes that are not valid, sequences, supplementary characters, shifts at odd places - goes
// the path.
class Table {
public:
  // `isBare`: neither page has a signature.
  Table(Path &path, bool isBare);
  // Begins with what another one for the same pages and policy has learned.
  Table(Path &path, const Table &other);

  // False if the path must translate the field.
  bool translate(std::string_view field, Room room, Done &done) {
    return run_ != nullptr && field.size() <= Path::longestField &&
           (this->*run_)(field, room, done);
  }
  // From now on the path translates every field.
  void turnOff() { run_ = nullptr; }

private:
  using Runner = bool (Table::*)(std::string_view field, Room room, Done &done);

  void reserve();
  void chooseSource();
  template <class Source>
  void use(std::size_t rows);

  // The loops. `source` is moved; `refused` are flags of rows that only the path can handle.
  template <class Source, bool shifts>
  bool run(std::string_view field, Room room, Done &done);
  template <class Source, bool shifts>
  bool runToEnd(std::string_view field, Room room, Done &done);
  template <class Source, bool shifts>
  int runBlocks(const char *&source, const char *end, Output<shifts> &output, Row refused,
                bool mode);
  template <class Source>
  const char *trim(const char *begin, const char *end, int64_t &cut);
  template <class Source, bool isSafe>
  Row nextRow(const Row *rows, const char *&source, const char *end, bool &mode);
  template <class Source, bool shifts>
  bool finish(Output<shifts> output, const char *begin, const char *end, int64_t cut, Room room,
              Done &done);
  bool addBlanks(int64_t cut, Room room, Done &done) const;

  Row rowOf(uint32_t code) { return rows_[code] != 0 ? rows_[code] : learn(code); }
  Row learn(uint32_t code);
  Row ask(uint32_t code);

  struct Free {
    void operator()(Row *rows) const { std::free(rows); }
  };

  Path &path_;
  const bool isPadded_;
  const bool putsBlanks_;
  const int64_t width_; // of the text, at most
  Runner run_ = nullptr;
  std::size_t (*spell_)(uint32_t code, char *bytes) = nullptr;
  std::size_t size_ = 0; // in rows
  std::unique_ptr<Row[], Free> rows_;
  std::bitset<256> learned_; // blocks of 256 rows that have any
};

} // namespace zelfields
