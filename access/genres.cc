#include "access/genres.h"

namespace browser {

const GenreAcces kFacturesClients{1, "FC", "C", "Le compte Client est inexistant !", "Client <"};
const GenreAcces kFacturesFournisseurs{2, "FF", "F", "Le compte Fournisseur est inexistant !", "Fournisseur <"};

}  // namespace browser
