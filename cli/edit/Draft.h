#pragma once

#include "edit/Proof.h"
#include "edit/SourceFile.h"
#include "lint/Model.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace edit {

/// A part of a file's text and what is to be written in its place.
struct TextChange {
    std::size_t offset;
    std::size_t length;
    std::string text;
};

/// The text with the changes, which do not overlap.
[[nodiscard]] std::string changed(std::string text, std::vector<TextChange> changes);

/// A database whose files can be changed in memory.
class Draft {
public:
    struct File {
        std::string path;   ///< where it is to be
        std::string family; ///< its name without the extension
        std::size_t layer;  ///< which directory it is in; 0 is on top
        std::string text;
        std::string formerPath; ///< where it is; empty: it is new
        std::string formerText;
        bool isRemoved = false;
    };

    /// Any files.
    explicit Draft(std::vector<File> files);

    /// The files of the open database.
    /// @throw CommandError (FAULT) if one of them cannot be read
    [[nodiscard]] static Draft ofDatabase();

    /// All files by family; of a family the bottom layer first.
    [[nodiscard]] std::vector<File>& files() { return m_files; }
    [[nodiscard]] const std::vector<File>& files() const { return m_files; }

    /// The file of a family in a layer, which is created if it does not exist.
    /// @param directory of the layer
    [[nodiscard]] File& fileOf(const std::string& family, std::size_t layer, const std::string& directory);

    /// Restores the order of the files after one was added or renamed.
    void sort();

    /// The database with these texts.
    [[nodiscard]] lint::Model model() const;

    /// What is to be written.
    [[nodiscard]] std::vector<Rewrite> rewrites() const;

    /// The same, as a patch.
    [[nodiscard]] std::string diff() const;

private:
    std::vector<File> m_files;
};

/// Changes the text of a file. One that was in its canonical form stays in it.
void setText(Draft::File& file, std::string text);

} // namespace edit
