#ifndef MSGBOOK_FACSTDICTIONARY_H
#define MSGBOOK_FACSTDICTIONARY_H

#include <map>
#include <string>
#include <vector>

// The host's string table: localised words and messages by key, read from
// <folder>messages/<procedure>.<language>.txt, one "key<TAB>text" per line ('#' starts a comment).
// A key is looked up in the procedure's table, then in the common table ("common"); each in the
// dictionary's language first, then in English. Texts are the host's multibyte text, unchanged.
namespace msgbook {

// The language of new dictionaries ("en" unless the host sets one, e.g. "de" or "zh_tw").
void setHostLanguage(const std::string& language);
std::string hostLanguage();

// Whether a procedure or language name can be part of a table's file name: a plain word of letters,
// digits, '_' and '-', at most 64 characters.
bool isPlainName(const std::string& name);

class FacSTDictionary {
public:
    // folder: the resource folder, ending with '/'.
    explicit FacSTDictionary(std::string folder);
    FacSTDictionary(std::string folder, std::string language);
    // Over a language folder <resource folder>messages/<language>/ (the trailing '/' optional): the
    // tables stay messages/<procedure>.<language>.txt. A path of another form names no table.
    static FacSTDictionary overLanguageFolder(const std::string& path);

    void SetProcedure(const std::string& procedure);
    const std::string& GetProcedure() const { return procedure_; }
    const std::string& GetLanguage() const { return language_; }

    // The text of the key; the key itself when no table has it.
    std::string LookUp(const std::string& key) const;
    // As above; status is set to 1 when no table has the key and left alone otherwise.
    std::string LookUp(const std::string& key, unsigned long& status) const;

    // Limits that keep a hostile table from exhausting memory; longer files or lines are cut.
    static constexpr std::size_t kMaxFileBytes = 4u << 20;
    static constexpr std::size_t kMaxLineBytes = 64u << 10;

private:
    using Table = std::map<std::string, std::string, std::less<>>;
    const Table& table(const std::string& procedure, const std::string& language) const;
    bool find(const std::string& key, std::string& text) const;

    std::string folder_;
    std::string language_;
    std::string procedure_;
    mutable std::map<std::string, Table> loaded_; // by file name
};

} // namespace msgbook

#endif
