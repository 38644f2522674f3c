#include "quarvo/frame/Apports.h"

#include <algorithm>

#include "host/field/Field.h"
#include "host/table/Champ.h"

namespace quarvo::frame {

using namespace host;

namespace {

// value × (1 − rate / 100), exactly.
Monnaie netDe(const Monnaie& value, double rate) {
  Monnaie hundred(100);
  return value * (hundred - Monnaie::fromDouble(rate)) / hundred;
}

}  // namespace

EnteteAchat enteteAchat(const std::string& table, const Colonne& colonne) {
  EnteteAchat e;
  e.facture = table == "GAPEFAC";
  e.avoir = e.facture && colonne("TYPE").toChaine() == "A";
  e.tauxRemise = toDouble(colonne("TAUX_REMISE"));
  e.tauxEscompte = toDouble(colonne("TAUX_ESCOMPTE"));
  e.brut = toMonnaie(colonne("BRUT"));
  e.portHt = toMonnaie(colonne("PORT_HT"));
  e.fraisHt = toMonnaie(colonne("FRAIS_HT"));
  return e;
}

LigneAchat ligneAchat(const Colonne& colonne) {
  LigneAchat l;
  l.puht = toMonnaie(colonne("PUHT"));
  l.tauxRemise = toDouble(colonne("TAUX_REMISE"));
  l.ht = toMonnaie(colonne("HT"));
  l.qte = toDouble(colonne("QTE"));
  l.qteSoldee = toDouble(colonne("QTE_SOLDEE"));
  l.qtt = toDouble(colonne("QTT"));
  return l;
}

ApportLigne apportLigne(const EnteteAchat& entete, const LigneAchat& ligne) {
  ApportLigne a;
  a.puht = netDe(ligne.puht, ligne.tauxRemise);
  a.puht = netDe(a.puht, entete.tauxRemise);
  a.puht = netDe(a.puht, entete.tauxEscompte);
  // Carriage and costs are amounts for the whole line: each unit bears its share divided by the
  // line's quantity (added as they are, the share would be counted once per unit).
  Monnaie lineQte = Monnaie::fromDouble(ligne.qte);
  if (!entete.brut.isZero() && !lineQte.isZero()) {
    a.puht += entete.portHt * ligne.ht / entete.brut / lineQte;
    a.puht += entete.fraisHt * ligne.ht / entete.brut / lineQte;
  }
  if (entete.facture) {
    a.qte = entete.avoir ? -ligne.qte : ligne.qte;
    a.qtt = 0;
  } else {
    a.qte = ligne.qte - ligne.qteSoldee;
    a.qtt = ligne.qtt;
  }
  a.ht = valeurArrondie(Monnaie::fromDouble(a.qte) * a.puht, 2, '=');
  return a;
}

ApportLien apportLien(const std::string& composant, const Monnaie& ht, double qte, double qtt,
                      bool receptions) {
  ApportLien a;
  if (composant == "GAPECOM") {
    a.engage = ht;
  } else if (composant == "GAPEFAC" || composant == "AFEFFO") {
    a.realise = ht;
  } else if (composant == "GAPEBL" && receptions && qte != 0 && qte - qtt != 0) {
    a.realise =
        valeurArrondie(ht * Monnaie::fromDouble(qte - qtt) / Monnaie::fromDouble(qte), 2, '=');
  }
  return a;
}

ApportLien apportLien(Table& lien, bool receptions) {
  return apportLien(lien.valeur("COMPOSANT").toChaine(), toMonnaie(lien.valeur("HT")),
                    toDouble(lien.valeur("QTE")), toDouble(lien.valeur("QTT")), receptions);
}

void restesEtAvancement(Table& ligne) {
  Champ vrea("VREA", ligne);
  Champ vraf("VRAF", ligne);
  double hbud = toDouble(ligne.valeur("HBUD"));
  Monnaie vbud = toMonnaie(ligne.valeur("VBUD_D"));
  if (ligne.valeur("AFFECTE").toChaine() != "O") {
    double hraf = hbud - toDouble(ligne.valeur("HREA"));
    Monnaie reste = vbud - vrea.at(0);
    if ((hbud == 0 && vbud.isZero()) || hraf < 0) {
      hraf = 0;
      reste = Monnaie();
    }
    if (reste < Monnaie()) reste = Monnaie();
    ligne.ecrire("HRAF", Valeur::dbl(hraf));
    for (size_t i = 0; i < 3; ++i) vraf.setAt(i, reste);
  }
  double hraf = toDouble(ligne.valeur("HRAF"));
  double avt = 0;
  if (hbud != 0) {
    avt = (hbud - hraf) / hbud * 100;
  } else if (!vbud.isZero()) {
    avt = ((vbud - vraf.at(0)) * int64_t{100} / vbud).toDouble();
  }
  ligne.ecrire("AVT", Valeur::dbl(std::clamp(avt, 0.0, 100.0)));
}

}  // namespace quarvo::frame
