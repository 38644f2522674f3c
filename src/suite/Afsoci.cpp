#include "suite/Afsoci.h"

#include "host/session/Session.h"
#include "host/table/Champ.h"

namespace quarvo::suite {

using namespace host;

Afsoci::Afsoci(Evt* evt) : TableInterface(evt) {
  addBranch("LECTURE_CODE", [this](Evt* e) { lectureCode(e); });
  addBranch("CONTROLER_DATE", [this](Evt* e) { controlerDate(e); });
}

void Afsoci::lectureCode(Evt* evt) {
  std::string code = evt->valeur(0).toChaine();
  if (code == "SOCIETE") code = session().societe();
  erreurMethode(lireDans("CODE", Valeur::chaine(code)) ? 0 : 1, evt);
}

void Afsoci::controlerDate(Evt* evt) {
  Field& date = this->date("P_DATE");
  Field& year = entier("P_N");
  Field& period = entier("P_M");
  evt->param(0, date, 1);
  evt->param(1, year, 1);
  evt->param(2, period, 1);
  year.set(int64_t{0});
  period.set(int64_t{0});
  Table company(this, nomBase(), "AFSOCI", "CONTROLE");
  if (date.date().empty() ||
      company.chercher(3, "CODE", '=', Valeur::chaine(session().societe())) != 0) {
    erreurMethode(1, evt);
    return;
  }
  auto starts = splitList(company.valeur("DATE_DEBUT").toChaine());
  auto ends = splitList(company.valeur("DATE_FIN").toChaine());
  Date d = date.date();
  for (size_t i = 0; i < starts.size() && i < ends.size(); ++i) {
    auto from = Date::parse(starts[i]);
    auto to = Date::parse(ends[i]);
    if (!from || !to || from->empty() || to->empty() || d < *from || *to < d) continue;
    year.set(static_cast<int64_t>(i + 1));
    int months = (d.year() - from->year()) * 12 + static_cast<int>(d.month()) -
                 static_cast<int>(from->month()) + 1;
    period.set(static_cast<int64_t>(months));
    erreurMethode(0, evt);
    return;
  }
  erreurMethode(1, evt);
}

}  // namespace quarvo::suite
