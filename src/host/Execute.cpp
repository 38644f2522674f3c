#include "host/Execute.h"

#include "host/automate/Automate.h"
#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::host {

std::optional<Valeur> Execute::execute(Automate& automate, const std::string& expression) {
  auto dot = expression.find('.');
  if (dot == std::string::npos) {
    Field* f = automate.champ(expression);
    if (f == nullptr) return std::nullopt;
    return f->value();
  }
  std::string table = expression.substr(0, dot);
  std::string column = expression.substr(dot + 1);
  if (Table* t = automate.tableParContexte(table)) {
    if (!t->store().schema().index(column)) return std::nullopt;
    return t->valeur(column);
  }
  if (table.rfind("I_", 0) == 0) {
    MemoryStore& record = automate.session().memoire(table);
    auto i = record.schema().index(column);
    if (!i) return std::nullopt;
    const Row& row = record.firstRow();
    return *i < row.values.size() ? row.values[*i] : defaultOf(record.schema().columns()[*i].kind);
  }
  return std::nullopt;
}

}  // namespace quarvo::host
