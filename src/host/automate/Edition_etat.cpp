#include "host/automate/Edition_etat.h"

#include <map>

#include "host/report/Moteur.h"
#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::host {

namespace {
std::map<const Session*, std::filesystem::path>& destinations() {
  static std::map<const Session*, std::filesystem::path> map;
  return map;
}
}  // namespace

Edition_etat::Edition_etat(Evt* creating) : Traitmnt(creating) {}

Edition_etat::Destination::Destination(Session& session, std::filesystem::path file)
    : session_(session) {
  destinations()[&session_] = std::move(file);
}

Edition_etat::Destination::~Destination() {
  destinations().erase(&session_);
}

std::filesystem::path Edition_etat::destination(Session& session, const std::string& report) {
  auto it = destinations().find(&session);
  if (it != destinations().end()) return it->second;
  Session::Scope scope(session);
  return Table::repSGBD() / "VOVOVA" / (session.utilisateur() + ".$so") / (report + ".pdf");
}

void Edition_etat::dupliquer(const std::string& from, const std::string& to) {
  MemoryStore& source = session().memoire(from);
  MemoryStore& target = session().memoire(to);
  target.clear();
  target.schema() = source.schema();
  Row row;
  for (RowId id : source.select({})) {
    if (source.fetch(id, row)) target.insert(row);
  }
}

void Edition_etat::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT"}) {
    if (termine()) break;
    raise(label, e);
  }
  if (!termine()) {
    const report::Etat* layout = report::Etat::trouver(report_);
    if (layout == nullptr) {
      session().ui().incident("L'état " + report_ + " n'existe pas : l'impression est impossible.");
      erreurMethode(1, e);
    } else {
      report::Moteur moteur(*this, *layout);
      std::string error;
      if (!moteur.imprimer(destination(session(), report_), error)) {
        session().ui().incident("Impression impossible : " + error);
        erreurMethode(1, e);
      }
      pages_ = moteur.pages();
    }
  }
  if (!termine()) raise("FIN", e);
  sortir();
}

}  // namespace quarvo::host
