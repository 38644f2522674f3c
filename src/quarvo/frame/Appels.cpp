#include "quarvo/frame/Appels.h"

namespace quarvo::frame {

using namespace host;

int appeler(Automate& caller, const std::string& module, const std::string& label,
            std::vector<Arg> args) {
  EvtParamRef evt(std::move(args));
  caller.appelerProcedure("*", module, "INTERFACE", label, &evt, -1);
  return caller.erreurMethode();
}

bool numeroter(Automate& caller, const std::string& base, const std::string& table, Field& ident) {
  ident.set("");
  for (const char* label : {"ATTRIBUE_NUMERO", "VALIDE_NUMERO"}) {
    if (appeler(caller, "ZUMNDOC", label,
                {val(base), val("NUMEROS"), val(table), val(""), val(10), ref(ident)}) != 0) {
      return false;
    }
  }
  return true;
}

static void message(Automate& caller, Field& answer, const std::string& label,
                    const std::string& number, std::vector<std::string> extra) {
  std::vector<Arg> args{val(number), ref(answer)};
  for (auto& e : extra) args.push_back(val(std::move(e)));
  appeler(caller, "COMMUN", label, std::move(args));
}

void messageOk(Automate& caller, Field& answer, const std::string& number,
               std::vector<std::string> args) {
  message(caller, answer, "MESS_OK", number, std::move(args));
}

bool messageOn(Automate& caller, Field& answer, const std::string& number,
               std::vector<std::string> args) {
  message(caller, answer, "MESS_ON", number, std::move(args));
  return answer.text() == "1";
}

}  // namespace quarvo::frame
