// The suite's text catalogues: messages by number ("messages.tsv") and labels by code
// ("labels.tsv"), French, one "KEY<TAB>TEXT" line each after a header line. Loaded once per
// file and shared read-only by every session of the process.
#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace quarvo::suite {

class Catalogue {
 public:
  // The catalogue in `file`; an unreadable file gives an empty catalogue.
  static const Catalogue& of(const std::filesystem::path& file);
  // The text of `key`, or empty when absent.
  std::string text(const std::string& key) const;
  bool contains(const std::string& key) const { return texts_.count(key) > 0; }

 private:
  std::map<std::string, std::string> texts_;
};

// Replaces "%1", "%2", ... in `text` by `args` in order.
std::string substitute(std::string text, const std::vector<std::string>& args);

}  // namespace quarvo::suite
