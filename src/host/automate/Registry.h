// Registration of automata with the runtime.
//
// A module registers, while its library initialises, a fixed sequence of static records: runtime
// globals (`VariableGlobale`), then per source unit a `Global` record, one `Module` record per
// automaton (its name and factory) and a `Source` record. The registry keeps them in
// registration order; records unregister in reverse order when destroyed. The runtime creates
// automata only through a registered factory.
//
// A factory takes the creating event and returns the new automaton or null: it obtains storage
// from `UniqueAlloc`, constructs in it, and gives the storage back with `UniqueFree` when the
// constructor throws. `AutomateDeleter` is the matching destruction.
#pragma once

#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/field/Field.h"

namespace quarvo::host {

class Automate;
class Evt;

using Fabrique = Automate* (*)(Evt*);

void* UniqueAlloc(size_t size) noexcept;
void UniqueFree(void* storage) noexcept;

struct AutomateDeleter {
  void operator()(Automate* a) const noexcept;
};
using AutomatePtr = std::unique_ptr<Automate, AutomateDeleter>;

template <class T>
Automate* fabriquer(Evt* evt) {
  void* storage = UniqueAlloc(sizeof(T));
  if (storage == nullptr) return nullptr;
  try {
    return ::new (storage) T(evt);
  } catch (...) {
    UniqueFree(storage);
    throw;
  }
}

struct RecordEntry {
  std::string kind;  // "Variable", "Global", "Module", "Source"
  std::string first;
  std::string second;
};

class Registry {
 public:
  static Registry& instance();

  Fabrique find(const std::string& name) const;
  // Automaton names in registration order.
  std::vector<std::string> names() const;
  const std::vector<RecordEntry>& records() const { return records_; }
  Field* global(const std::string& name) const;

  void add(RecordEntry entry, Fabrique factory = nullptr, std::unique_ptr<Field> global = {});
  void remove(const RecordEntry& entry);

 private:
  struct Item {
    RecordEntry entry;
    Fabrique factory;
    std::unique_ptr<Field> global;
  };
  // Rebuilds the by-name index of factories (the first registration of a name wins).
  void indexer();

  std::vector<Item> items_;
  std::vector<RecordEntry> records_;
  std::unordered_map<std::string, Fabrique> factories_;
};

// A runtime global value declared by a module (found by name by the runtime).
class VariableGlobale {
 public:
  VariableGlobale(const char* name, const char* label, const char* third, int access,
                  const char* initial);
  ~VariableGlobale();

 private:
  RecordEntry entry_;
};

class Global {
 public:
  Global(const char* provider, const char* module);
  ~Global();

 private:
  RecordEntry entry_;
};

class Module {
 public:
  Module(const char* unused, const char* name, Fabrique factory, bool flag, const char* unused2);
  ~Module();

 private:
  RecordEntry entry_;
};

class Source {
 public:
  Source(const char* key, const char* unused);
  ~Source();

 private:
  RecordEntry entry_;
};

}  // namespace quarvo::host
