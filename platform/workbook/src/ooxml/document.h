// SPDX-License-Identifier: MIT
// One open workbook package: its parts as read, the workbook-wide state
// (string pool, styles, date system) and its worksheets. Saving writes only
// the parts that changed; every other part is copied as it stands.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

#include "cells/sheet_model.h"
#include "cells/string_pool.h"
#include "ooxml/shared_strings.h"
#include "ooxml/workbook_part.h"
#include "package/content_types.h"
#include "package/relationships.h"
#include "package/zip_source.h"
#include "styles/styles.h"
#include "workbook/engine.h"

namespace workbook {

struct WorksheetEntry {
    std::string name;
    std::string part;  // entry name in the package
    // Read from the part when the sheet is first used, not when the workbook
    // opens: a workbook of many sheets costs only the sheets asked for.
    bool loaded = false;
    SheetModel model;
    bool dirty = false;
    // The part as the model's layout knows it, when that is no longer the
    // package's (a cleared sheet, until it is saved).
    std::unique_ptr<PackageSource> base;
};

class Document {
public:
    // Reads a package from disk; raises ComError when it can't be read.
    static std::unique_ptr<Document> Open(const std::string &path);
    // A new workbook with one empty sheet, not yet on disk.
    static std::unique_ptr<Document> CreateNew();

    const std::string &Path() const { return path_; }
    bool Date1904() const { return date1904_; }
    StringPool &Strings() { return pool_; }
    Styles &CellFormats() { return styles_; }

    size_t WorksheetCount() const { return sheets_.size(); }
    const std::vector<SheetTab> &Tabs() const { return tabs_; }
    // The sheet, read from its part on first use. Raises ComError, with the
    // file's name first, when the part can't be read.
    WorksheetEntry &Worksheet(size_t index);
    // Marks a sheet as changed, so that the next save writes it.
    void Touch(size_t index) { Worksheet(index).dirty = true; }
    // Empties a sheet of its cells and of what dresses them, and lets the
    // next save leave out the parts only that took along (see
    // Worksheet::Clear). Raises ComError before any change when it can't.
    void ClearWorksheet(size_t index);

    // Writes the package to path atomically and makes path the workbook's file.
    void SaveAs(const std::string &path);
    void Save();

private:
    Document() = default;
    void Load(std::unique_ptr<PackageSource> source);
    std::string FindWorkbookPart() const;
    // Reads one sheet's part into its model, within what the sheets read
    // before leave of the workbook's bound on cells.
    void ReadWorksheet(size_t index);
    // Reads a sheet; when it holds formulas without a result, reads every
    // sheet (formulas may name any) and computes them, or reads none.
    void LoadWorksheet(size_t index);
    // Gives the formulas stored without a result theirs.
    void ComputeFormulas();
    std::string ReadPart(const std::string &entry) const { return source_->ReadAll(entry); }

    std::unique_ptr<PackageSource> source_;
    std::string path_;
    // What a workbook read from a format the engine doesn't write came from
    // ("a binary workbook (.xls)"); empty for a package. Such a one isn't saved.
    std::string convertedFrom_;
    std::string workbookPart_;
    std::string mainNs_;
    bool date1904_ = false;

    std::string contentTypesText_;
    ContentTypes contentTypes_;
    std::string workbookRelsPart_;
    std::string workbookRelsText_;
    Relationships workbookRels_;

    std::string sharedStringsPart_;  // empty when the package has none
    SharedStrings sharedStrings_;
    uint32_t poolSharedCount_ = 0;  // pool indexes below it are the part's items as read
    uint32_t sharedCount_ = 0;      // items in the shared-strings part now
    // Pooled texts beyond the part's own items, and their index in the part.
    std::unordered_map<uint32_t, uint32_t> sharedIndexOf_;

    std::string stylesPart_;  // empty when the package has none
    Styles styles_;

    // Changes the next save makes to parts beside the sheets: relationships
    // parts with a new text, and parts left out.
    std::map<std::string, std::string> editedRels_;
    std::set<std::string> removedParts_;

    StringPool pool_;
    std::vector<WorksheetEntry> sheets_;
    std::vector<SheetTab> tabs_;  // every sheet, the worksheets among them
};

}  // namespace workbook
