#include "suite/TableInterface.h"

#include <ctime>

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

void horodater(Table& piece) {
  std::time_t t = std::time(nullptr);
  std::tm local{};
  localtime_r(&t, &local);
  char heure[16];
  std::strftime(heure, sizeof heure, "%H:%M:%S", &local);
  piece.ecrire("DATE_MAJ", Valeur::date(Date::today()));
  piece.ecrire("HEURE_MAJ", Valeur::chaine(heure));
}

TableInterface::TableInterface(Evt* evt) : Interface2(evt) {
  addBranch("INIT", [this](Evt* e) { init(e); });
  addBranch("LECTURE_CODE",
            [this](Evt* e) { erreurMethode(lireDans("CODE", e->valeur(0)) ? 0 : 1, e); });
  addBranch("LECTURE_NUMERO_DOC",
            [this](Evt* e) { erreurMethode(lireDans("NUMERO_DOC", e->valeur(0)) ? 0 : 1, e); });
  addBranch("ECRITURE", [this](Evt* e) { ecriture(e); });
}

std::string TableInterface::table() const {
  const std::string& name = nomAutomate();
  auto dash = name.rfind("-INTERFACE");
  return dash == std::string::npos ? name : name.substr(0, dash);
}

void TableInterface::init(Evt*) {
  nomTable(table());
}

bool TableInterface::lireDans(const std::string& column, const Valeur& value) {
  Table main(this, nomBase(), table(), "LECTURE");
  MemoryStore& record = session().memoire("I_" + table());
  record.clear();
  if (!main.store().schema().index(column)) return false;
  if (main.chercher(3, column, '=', value) != 0) return false;
  record.remplacerPar(main.ligne());
  return true;
}

void TableInterface::ecriture(Evt* evt) {
  Table record(this, nomBase(), "I_" + table(), "");
  Table main(this, nomBase(), table(), "ECRITURE");
  Valeur ident = evt->nbParams() > 0 ? evt->valeur(0) : record.valeur("IDENT");
  if (ident.toChaine().empty()) ident = record.valeur("IDENT");
  if (ident.toChaine().empty()) {
    erreurMethode(1, evt);
    return;
  }
  const Row& values = record.ligne();
  bool exists = main.chercher(3, "IDENT", '=', ident) == 0;
  if (!exists) main.preparer();
  const auto& columns = main.store().schema().columns();
  const auto& recordSchema = record.store().schema();
  for (const auto& col : columns) {
    auto i = recordSchema.index(col.name);
    if (i && *i < values.values.size()) main.ecrire(col.name, values.values[*i]);
  }
  main.ecrire("IDENT", ident);
  int rc = exists ? main.modifier() : main.inserer();
  erreurMethode(rc == 0 ? 0 : 1, evt);
}

}  // namespace quarvo::suite
