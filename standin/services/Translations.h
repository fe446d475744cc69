// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

#include <map>
#include <string>

namespace pugi {
class xml_document;
}

namespace standin {

/// The texts of modules in the user's language, from tables in XML, whose form docs/translations.md tells. A bundle
/// handle is the path of the folder that holds the module's resources, a zero-ended text.
class Translations : public Velmark::Implements<Translations, Velmark::FObject, Velmark::ITranslationService> {
public:
    static constexpr const char* ClassName = "Translations";

    /// The language of the texts, as the tables name it. At first there is none, and texts stay as they are.
    void setLanguage(std::string language) { m_language = std::move(language); }

    /// Takes the texts of all languages over. Refuses a table that is missing or broken as a whole. Of a text that stands
    /// in several tables the first translation stays; the domain makes no difference.
    Velmark::int32 addTable(Velmark::BundleHandle bundle, const char* file, const char* domain) override;
    /// Lasts as long as this object.
    const char16_t* translate(const char16_t* text) override;

private:
    /// The translation of each text.
    using Table = std::map<std::u16string, std::u16string, std::less<>>;
    /// By language.
    using Tables = std::map<std::string, Table>;

    static Tables read(const pugi::xml_document& document);

    Tables m_tables;
    std::string m_language;
};

} // namespace standin
