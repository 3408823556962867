#ifndef PLOTAID_TEMPLATES_LOCALISE_H
#define PLOTAID_TEMPLATES_LOCALISE_H

// The dictionary set-up of every template action that localises chart text: the chart words of
// the host language's folder, in the code page of that language.

#include <grx/ChartString.h>

#include <ctime>
#include <string>

namespace plotaid::detail {

// The host code page of a language code ("ja" CP932, ...); CP1252 for codes without one of their own.
std::string codePageOf(const std::string& languageCode);

// The first folder name of fullPath after basePath; empty when fullPath does not extend basePath.
std::string languageCodeOf(const std::string& fullPath, const std::string& basePath);

// Fills the text's placeholders (ChartBase::updateText) with the GRAPH words of the language folder
// that the resource path service names.
void localiseChartText(ChartString& text);
// The same over the given language folder and its base, at a given moment.
void localiseChartTextAt(ChartString& text, const std::string& fullPath, const std::string& basePath,
                         const std::tm& now);
// The same for a language of the resource folder other than the host's; false, the text unchanged,
// when the language is no plain name or there is no resource folder.
bool localiseChartTextFor(ChartString& text, const std::string& language, const std::tm& now);

// The GRAPH word or message of `key` in the host's language; the key itself when no table has it.
ChartString localisedWord(const std::string& key);

} // namespace plotaid::detail

#endif
