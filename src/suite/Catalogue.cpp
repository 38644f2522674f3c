#include "suite/Catalogue.h"

#include <fstream>
#include <memory>
#include <mutex>

namespace quarvo::suite {

const Catalogue& Catalogue::of(const std::filesystem::path& file) {
  static std::mutex mutex;
  static std::map<std::string, std::unique_ptr<Catalogue>> loaded;
  std::lock_guard lock(mutex);
  auto& slot = loaded[file.string()];
  if (!slot) {
    slot = std::make_unique<Catalogue>();
    std::ifstream in(file);
    std::string line;
    bool header = true;
    while (std::getline(in, line)) {
      if (!line.empty() && line.back() == '\r') line.pop_back();
      if (header) {
        header = false;
        continue;
      }
      auto tab = line.find('\t');
      if (tab == std::string::npos) continue;
      slot->texts_[line.substr(0, tab)] = line.substr(tab + 1);
    }
  }
  return *slot;
}

std::string Catalogue::text(const std::string& key) const {
  auto it = texts_.find(key);
  return it == texts_.end() ? std::string() : it->second;
}

std::string substitute(std::string text, const std::vector<std::string>& args) {
  for (size_t i = args.size(); i > 0; --i) {
    std::string mark = "%" + std::to_string(i);
    for (size_t at = text.find(mark); at != std::string::npos; at = text.find(mark, at)) {
      text.replace(at, mark.size(), args[i - 1]);
      at += args[i - 1].size();
    }
  }
  return text;
}

}  // namespace quarvo::suite
