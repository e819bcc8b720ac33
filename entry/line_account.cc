#include "entry/parts.h"

namespace entry {

LineAccount::LineAccount(EntryScreen& screen, const char* labelControl, const char* chooseBranch)
    : Part(screen), label_control_(labelControl), choose_branch_(chooseBranch) {
  screen.line_ = this;
}

void LineAccount::provide(Handlers& handlers) {
  handlers.add(label_control_, &s_, &EntryScreen::lineAccountLabel);
  handlers.add(choose_branch_, &s_, &EntryScreen::chooseLineAccount);
}

void LineAccount::openSelection() {
  Table& t = accounts();
  t.initRequete();
  std::string nature = s_.lineNature();
  if (!nature.empty()) t.ajouteFiltre(NATUC(), '?', nature);
  t.ajouteFiltre(CCTRA(), '#', "O");
  t.choisitIndex("NUMCP");
  t.activeRequete();
}

AccountOfNature::AccountOfNature(EntryScreen& screen) : LineAccount(screen, "LST_VLIBCP2", "COMPT2_CHOISIR") {
  bind({.number = &VNUMCP2,
        .label = &VLIBCP2,
        .accounts = &COMPT2,
        .NUMCP = &COMPT2_NUMCP,
        .LIBCP = &COMPT2_LIBCP,
        .NATUC = &COMPT2_NATUC,
        .CCTRA = &COMPT2_CCTRA,
        .COTVA = &COMPT2_COTVA,
        .CPOST = &COMPT2_CPOST,
        .CCRIT = &COMPT2_CCRIT});
}

}  // namespace entry
