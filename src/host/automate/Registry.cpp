#include "host/automate/Registry.h"

#include <algorithm>
#include <new>

#include "host/automate/Automate.h"

namespace quarvo::host {

void* UniqueAlloc(size_t size) noexcept {
  return ::operator new(size, std::nothrow);
}
void UniqueFree(void* storage) noexcept {
  ::operator delete(storage);
}

void AutomateDeleter::operator()(Automate* a) const noexcept {
  if (a == nullptr) return;
  a->~Automate();
  UniqueFree(a);
}

Registry& Registry::instance() {
  static Registry registry;
  return registry;
}

Fabrique Registry::find(const std::string& name) const {
  // Every call of another module's interface looks its factory up: by hash, not by scan.
  auto it = factories_.find(name);
  return it != factories_.end() ? it->second : nullptr;
}

void Registry::indexer() {
  factories_.clear();
  for (const auto& item : items_) {
    if (item.factory != nullptr) factories_.try_emplace(item.entry.first, item.factory);
  }
}

std::vector<std::string> Registry::names() const {
  std::vector<std::string> out;
  for (const auto& item : items_) {
    if (item.factory != nullptr) out.push_back(item.entry.first);
  }
  return out;
}

Field* Registry::global(const std::string& name) const {
  for (const auto& item : items_) {
    if (item.global && item.global->name() == name) return item.global.get();
  }
  return nullptr;
}

void Registry::add(RecordEntry entry, Fabrique factory, std::unique_ptr<Field> global) {
  records_.push_back(entry);
  items_.push_back({std::move(entry), factory, std::move(global)});
  indexer();
}

void Registry::remove(const RecordEntry& entry) {
  auto same = [&](const RecordEntry& e) {
    return e.kind == entry.kind && e.first == entry.first && e.second == entry.second;
  };
  for (auto it = items_.rbegin(); it != items_.rend(); ++it) {
    if (same(it->entry)) {
      items_.erase(std::next(it).base());
      break;
    }
  }
  for (auto it = records_.rbegin(); it != records_.rend(); ++it) {
    if (same(*it)) {
      records_.erase(std::next(it).base());
      break;
    }
  }
  indexer();
}

static std::string text(const char* s) {
  return s ? s : "";
}

VariableGlobale::VariableGlobale(const char* name, const char* label, const char* third, int access,
                                 const char* initial)
    : entry_{"Variable", text(name), text(initial)} {
  Registry::instance().add(
      entry_, nullptr,
      std::make_unique<Field>(text(name), text(label), text(third), access, Kind::Chaine,
                              Valeur::chaine(text(initial)), nullptr));
}
VariableGlobale::~VariableGlobale() {
  Registry::instance().remove(entry_);
}

Global::Global(const char* provider, const char* module)
    : entry_{"Global", text(provider), text(module)} {
  Registry::instance().add(entry_);
}
Global::~Global() {
  Registry::instance().remove(entry_);
}

Module::Module(const char*, const char* name, Fabrique factory, bool, const char*)
    : entry_{"Module", text(name), ""} {
  Registry::instance().add(entry_, factory);
}
Module::~Module() {
  Registry::instance().remove(entry_);
}

Source::Source(const char* key, const char*) : entry_{"Source", text(key), ""} {
  Registry::instance().add(entry_);
}
Source::~Source() {
  Registry::instance().remove(entry_);
}

}  // namespace quarvo::host
