// The selection screen of the shared utilities: a window that gathers a period, a grouping
// criterion and selection criteria, then launches a treatment or a report on validation.
//
// Fields it gives every selection screen (the derived screen reads them by role):
// - "VDATEMIN", "VDATEMAX": the period; "VBORNE": a period preset code applied by "BORNE_DATE"
//   through "COMMUN" "BORNE_DATE" (for example "M" the current month of the company);
// - "VCLASSEMENT": the grouping criterion, the prefix of a project column family ("AFCLIE",
//   "AFETAB", "AFSERV", "AFRPS1", "AFRPS2", "AFCRI1" ... "AFCRI5", empty for none), and
//   "VCLASSEMENT_LIB" its label, set when the criterion list closes;
// - "VSELECTION": the one-line summary of the selection, built by "CONSTRUIRE_VSELECTION";
// - "VJAUGE": the gauge (percentage) shown while the selection runs;
// - project choice "VAFFA_CHOIX" ("T" all projects, "B" one budget, anything else one project),
//   "VAFFA_CODE" (project code) and "VAFEBUD_IDENT" (budget identifier); for the screens that
//   choose one project or all, "VAFFA_TOUTES" ("T" all, "U" the one of "VAFFA_CODE" and
//   "VAFFA_IDENT"): "VAFFA_TOUTES" set to "T" empties the project, "VAFFA_CODE_CHOISIR" offers
//   the projects ("AFAFFA" "CHOIX") from the one typed;
// - department choice "VSERV_CHOIX" ("U" one department, whose code is "VSERV_CODE");
// - range values "VCLI", "VRPS1", "VRPS2", "VCRI1" ... "VCRI5" (empty keeps every code);
// - budget-state options "VETAT" ("T" all, "A", "NC", "NA", "C"), "VCLOS" and "VCLOS2" ("O"
//   or "N": closed budgets kept, closed budgets of earlier years dropped);
// - budget-type options "VTYPE_OPT" ("T" all, "U" one) and "VTYPE_CHOIX" ("F", "E", "R", "N");
// - output choice "VSORTIE" (0 export to a spreadsheet file, otherwise print) and the export
//   file name "VFICHIER".
// Its screen is "SELETAT" (db/screens/SELETAT.json); a derived screen names its own, which
// extends it.
//
// Labels it binds: "INIT", "AVANT_DEBUT", "DEBUT", "DEBUT_ACTIVATION", "VALID" (the OK button:
// raises "VALIDATION"), "VALIDATION", "VAFFA_TOUTES", "VAFFA_CODE_CHOISIR", "BORNE(1,7)" (the
// seven period buttons: "COMMUN" "BORNE_DATE" with the button's number, `borne`),
// "EXPORTER_LISTE_CSV" (parameter 0: the list, "LST" by default: `exporterListeCsv`),
// "VCLASSEMENT_LIB_CHOIX" (offers the criteria in a choice list), "VCLASSEMENT_LIB_FERME" (sets
// the criterion's label), "BORNE_DATE", "CONSTRUIRE_VSELECTION" (parameter 0: the parts of the
// summary, one letter each: "V" period, "A" projects and grouping, "E" budget states, "B"
// budget types, in the order given, joined by " ; "). A derived screen rebinds what it
// overrides; the option group is redisplayed with `reafficher`.
#pragma once

#include <string>

#include "host/automate/Fenetre_simple.h"

namespace quarvo::host {

class Seletat : public Fenetre_simple {
 public:
  explicit Seletat(Evt* creating);

  virtual void avant_debut(Evt*) {}
  virtual void debut_activation(Evt*) {}
  virtual void valid(Evt* evt);
  virtual void vaffa_toutes(Evt* evt);
  virtual void vaffa_code_choisir(Evt* evt);
  virtual void exporter_liste_csv(Evt* evt);
  void borne__1__7(Evt* evt);
  // Sets the period from period button `numero` (1 to 7) and redisplays it.
  void borne(int numero, Evt* evt);
  // Writes the rows a list shows to `file` for a spreadsheet: ";" between cells, UTF-8, the
  // columns' headers first; amounts and numbers as numbers, any text that a spreadsheet would
  // run as a formula (starting with "=", "+", "-" or "@") kept as text. False when the file
  // cannot be written.
  bool exporterListeCsv(const std::string& list, const std::string& file);
  virtual void vclassement_lib_choix(Evt* evt);
  virtual void vclassement_lib_ferme(Evt* evt);
  void borne_date(Evt* evt);
  void construire_vselection(Evt* evt);

  // The summary "CONSTRUIRE_VSELECTION" builds for `parts`.
  std::string resumeSelection(const std::string& parts) const;
  // Shows the gauge at done/total and keeps its percentage in "VJAUGE".
  void afficherJauge(double done, double total);
  void fermerJauge();
  // Redisplays a control or a group: its value is taken again from the field of that name.
  void reafficher(const std::string& control);

  // The grouping criteria offered, in list order, with their screen labels.
  static const std::vector<std::pair<std::string, std::string>>& criteres();

 protected:
  Field& vdatemin_;
  Field& vdatemax_;
  Field& vborne_;
  Field& vclassement_;
  Field& vclassementLib_;
  Field& vselection_;
  Field& vjauge_;
  Field& vaffaChoix_;
  Field& vaffaCode_;
  Field& vafebudIdent_;
  Field& vaffaToutes_;
  Field& vaffaIdent_;
  Field& vservChoix_;
  Field& vservCode_;
  Field& vcli_;
  Field& vrps1_;
  Field& vrps2_;
  Field& vcri1_;
  Field& vcri2_;
  Field& vcri3_;
  Field& vcri4_;
  Field& vcri5_;
  Field& vetat_;
  Field& vclos_;
  Field& vclos2_;
  Field& vtypeOpt_;
  Field& vtypeChoix_;
  Field& vsortie_;
  Field& vfichier_;

 private:
  bool jaugeOuverte_ = false;
};

}  // namespace quarvo::host
