#include "host/automate/Traitmnt.h"

namespace quarvo::host {

void Traitmnt::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT", "FAIRE"}) {
    if (termine()) break;
    raise(label, e);
  }
  sortir();
}

}  // namespace quarvo::host
