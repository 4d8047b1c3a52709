// The texts that loading and saving show, in code page 1252.
#pragma once

namespace carnet_texts {

inline constexpr const char* kNoCommand = "Erreur ligne %d : ligne incompl\xEAte (pas de commande) !";
// A line that holds a NUL byte: no writer could save it as it was read.
inline constexpr const char* kDamaged = "Erreur ligne %d : ligne endommag\xE9" "e (octet nul) !";
inline constexpr const char* kIncomplete = "Erreur ligne %d : commande <%s> incompl\xE8te !";
inline constexpr const char* kIncorrect = "Erreur ligne %d : commande <%s> incorrecte !";
inline constexpr const char* kWrongCount =
    "Erreur ligne %d : la commande <%s> n'a pas le bon nombre de param\xE8tres !";
inline constexpr const char* kShowLine = " (%s)";
inline constexpr const char* kStationIncomplete = "Erreur ligne %d : donn\xE9" "es incompl\xE8tes sur la station <%s> !";
inline constexpr const char* kReferenceIncomplete =
    "Erreur ligne %d : donn\xE9" "es incompl\xE8tes sur la r\xE9" "f\xE9rence <%s> !";
inline constexpr const char* kMesureIncomplete = "Erreur ligne %d : donn\xE9" "es incompl\xE8tes sur la mesure <%s> !";
inline constexpr const char* kPointIncomplete = "Erreur ligne %d : donn\xE9" "es incompl\xE8tes sur le point <%s> !";
inline constexpr const char* kPointDuplicated = "Attention : le point <%s> a \xE9t\xE9 dupliqu\xE9 !";
inline constexpr const char* kDistanceNote = "Distance H. = %.4f => DI = %.4f (AV = %.4f Gr)%%s";
inline constexpr const char* kCannotOpen = "Impossible d'ouvrir la Sitebook :\n%s !";
inline constexpr const char* kCannotSave = "Impossible d'enregistrer la Sitebook sous\n%s !";
inline constexpr const char* kOpenTitle = "S\xE9lectionnez la Sitebook \xE0 charger :";
inline constexpr const char* kSaveTitle = "Enregistrer la Sitebook sous";
inline constexpr const char* kFilter = "Sitebook NORVEX (*.geo)|*.geo||";

// Projection names chosen by the zone number of a "Cal_Cor" line (0 to 3).
inline constexpr const char* kLambertZones[4] = {"Projection Lambert Zone I", "Projection Lambert Zone II",
                                                 "Projection Lambert Zone III", "Projection Lambert Zone IV"};
inline constexpr const char* kNoProjection = "Aucune";

}  // namespace carnet_texts
