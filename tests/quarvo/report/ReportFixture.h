// Drives the follow-up report's selection screen headlessly on the demo data, with links
// written for the test, and prints what the screen built and wrote.
#pragma once

#include <cstdio>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::test {

class ReportFixture {
 public:
  ReportFixture() : t_(true) {
    // Links of the demo pieces to the demo budget lines (period tested: April to December).
    t_.sql(
        R"(INSERT INTO "QUARVO" ("IDENT","AFEBUD_IDENT","AFAFFA_IDENT","AFAFFA_CODE","AFLBUD_IDENT",
        "COMPOSANT","COMPOSANT_IDENT","PIECE","DATE_PIECE","QTE","HT") VALUES
      ('L01','0000000201','0000000011','AFF001','0000000211','GAPECOM','0000000401','CF26000001','2026-03-02',4,'720.00'),
      ('L02','0000000201','0000000011','AFF001','0000000211','GAPECOM','0000000401','CF26000001','2026-03-02',2,'630.00'),
      ('L03','0000000201','0000000011','AFF001','0000000211','GAPEBL','0000000501','BR26000001','2026-03-20',6,'1350.00'),
      ('L04','0000000201','0000000011','AFF001','0000000211','GAPEFAC','0000000601','FF26000001','2026-03-31',6,'1350.00'),
      ('L05','0000000201','0000000011','AFF001','0000000211','GAPEFAC','0000000603','AV26000001','2026-04-15',1,'-315.00'),
      ('L06','0000000201','0000000011','AFF001','0000000213','GAPECOM','0000000403','CF26000003','2026-05-05',60,'3000.00'),
      ('L14','0000000201','0000000011','AFF001','0000000213','GAPECOM','0000000403','CF26000003','2026-05-05',20,'600.00'),
      ('L07','0000000201','0000000011','AFF001','0000000213','GAPEFAC','0000000602','FF26000002','2026-05-29',40,'1764.00'),
      ('L08','0000000201','0000000011','AFF001','0000000214','GAPECOM','0000000402','CF26000002','2026-04-10',10,'2500.00'),
      ('L09','0000000201','0000000011','AFF001','0000000214','GAPEFAC','0000000604','FF26000003','2026-04-30',10,'3000.00'),
      ('L10','0000000201','0000000011','AFF001','0000000215','AFEFFO','0000000701','TE26000001','2026-06-15',8,'280.00'),
      ('L11','0000000201','0000000011','AFF001','0000000215','GAPEFAC','0000000699','XX26000009','2026-06-20',1,'50.00'),
      ('L12','0000000202','0000000012','AFF002','0000000221','GAPECOM','0000000402','CF26000002','2026-04-10',10,'950.00'),
      ('L13','0000000203','0000000013','AFF003','0000000231','GAPECOM','0000000404','CF26000004','2026-06-01',2,'360.00'))");
    // An invoice whose type is neither F nor A; a chapter given without its parenthesis.
    t_.sql(R"(INSERT INTO "GAPEFAC" ("IDENT","NUMERO_DOC","DESIG","TYPE","DATE_CREATION","VALIDEE")
              VALUES ('0000000699','XX26000009','Facture d''un autre type','X','2026-06-20',1);
              UPDATE "AFLBUD" SET "CHAPITRE2" = '2' WHERE "IDENT" = '0000000214';)");
  }

  TestSession& t() { return t_; }

  host::Automate& ouvrir() {
    t_.session().appelerModule("QUARVO-SELETAT1", nullptr);
    host::Automate* w = t_.session().fenetre("QUARVO-SELETAT1");
    if (w == nullptr) throw std::runtime_error("the selection screen did not open");
    return *w;
  }
  static void poser(host::Automate& w, const std::string& field, const std::string& value) {
    w.champ(field)->set(value);
  }
  // Raises a screen event and lets the session's event loop run the work it launched.
  int lever(host::Automate& w, const std::string& label) {
    host::EvtParamVal e;
    w.raise(label, &e);
    t_.session().executerEnAttente();
    return e.erreur();
  }
  // The selection of the tests: April to December 2026, exported to `file`.
  host::Automate& preparer(const std::string& file) {
    host::Automate& w = ouvrir();
    poser(w, "VDATEMIN", "01/04/2026");
    poser(w, "VDATEMAX", "31/12/2026");
    poser(w, "VSORTIE", "0");
    poser(w, "VFICHIER", file);
    return w;
  }

  // "M_APPR1" in the order its rows were made, one line per row.
  std::string lignes() {
    host::Table m(nullptr, "VOVOVA", "M_APPR1", "TEST");
    m.ouvrir();
    std::ostringstream out;
    while (m.lire(1) == 0) {
      out << m.valeur("IDENT").toChaine() << " | " << m.valeur("PIECE").toChaine() << " | "
          << m.valeur("DESIG").toChaine() << " | " << m.valeur("BUDGETE").toChaine() << " "
          << m.valeur("ENGAGE").toChaine() << " " << m.valeur("RECEPTIONNE").toChaine() << " "
          << m.valeur("FACTURE").toChaine() << "\n";
    }
    return out.str();
  }

  static std::string lire(const std::filesystem::path& file) {
    std::ifstream in(file, std::ios::binary);
    std::ostringstream s;
    s << in.rdbuf();
    return s.str();
  }
  // Output of a shell command (reading back files with the system's tools).
  static std::string commande(const std::string& cmd) {
    std::string out;
    FILE* p = popen(cmd.c_str(), "r");
    if (p == nullptr) return out;
    char buf[4096];
    size_t n;
    while ((n = fread(buf, 1, sizeof buf, p)) > 0) out.append(buf, n);
    pclose(p);
    return out;
  }

 private:
  TestSession t_;
};

}  // namespace quarvo::test
