// SPDX-License-Identifier: MIT
#include "ooxml/document.h"

#include <filesystem>
#include <map>
#include <optional>

#include "errors.h"
#include "foreign/converted_book.h"
#include "foreign/file_kind.h"
#include "foreign/foreign_readers.h"
#include "formulas/formula_computation.h"
#include "ooxml/new_package.h"
#include "ooxml/sheet_clearing.h"
#include "ooxml/sheet_reader.h"
#include "ooxml/sheet_writer.h"
#include "ooxml/workbook_part.h"
#include "package/atomic_file.h"
#include "package/part_graph.h"
#include "package/part_names.h"
#include "package/zip_writer.h"
#include "workbook/limits.h"
#include "xml/namespaces.h"

namespace workbook {
namespace {

std::string FolderOf(const std::string &part)
{
    size_t slash = part.rfind('/');
    return slash == std::string::npos ? std::string() : part.substr(0, slash + 1);
}

// What a file holds, in words; a zip package is told apart by its content.
std::string HeldKindName(FileKind kind, bool openDocument)
{
    if (kind != FileKind::Package) return KindName(kind);
    return openDocument ? "an OpenDocument spreadsheet (.ods)" : "an Office Open XML workbook (.xlsx, .xlsm)";
}

}  // namespace

std::unique_ptr<Document> Document::Open(const std::string &path)
{
    std::unique_ptr<Document> doc(new Document);
    doc->path_ = path;
    try {
        // Reading a FIFO or a device would wait for bytes that may never come.
        std::error_code ignored;
        const auto status = std::filesystem::status(path, ignored);
        if (std::filesystem::exists(status) && !std::filesystem::is_regular_file(status) &&
            !std::filesystem::is_directory(status))
            Fail(kBadFile, "it is a FIFO, a socket or a device, not a file");
        const FileKind kind = SniffFileKind(path);
        const FileKind named = KindOfExtension(path);
        std::unique_ptr<PackageSource> package;
        if (kind == FileKind::Package || kind == FileKind::Unknown) package = PackageSource::OpenFile(path);
        const bool openDocument = package && IsOpenDocument(*package);
        const bool namedOpenDocument = named == FileKind::Package && IsOpenDocumentName(path);
        if ((kind != FileKind::Unknown && named != FileKind::Unknown && kind != named) ||
            (named == FileKind::Package && openDocument != namedOpenDocument))
            Fail(kBadFile, std::string("the file holds ") + HeldKindName(kind, openDocument) +
                               ", not what its name says: give it the extension of what it holds");
        if (package && !openDocument) {
            doc->Load(std::move(package));
        } else {
            ConvertedBook book;
            ReadConverted(kind, path, package.get(), book);
            doc->convertedFrom_ = HeldKindName(kind, openDocument);
            doc->Load(PackageSource::FromParts(book.TakeParts()));
        }
    } catch (const automation::ComError &e) {
        // Whatever failed inside, the reason starts with the file it was in.
        throw automation::ComError(e.Code(), path + ": " + e.what());
    }
    return doc;
}

std::unique_ptr<Document> Document::CreateNew()
{
    std::unique_ptr<Document> doc(new Document);
    doc->Load(PackageSource::FromParts(NewWorkbookParts()));
    return doc;
}

std::string Document::FindWorkbookPart() const
{
    std::string rootRels = source_->Find("_rels/.rels");
    if (!rootRels.empty()) {
        Relationships rels = Relationships::Parse(ReadPart(rootRels), rootRels);
        if (const Relationship *r = rels.ByKind("officeDocument")) {
            if (r->external) Fail(kBadFile, "the workbook part lies outside the package");
            std::string part = source_->Find(ResolveTarget("", r->target));
            if (part.empty()) Fail(kBadFile, "the package has no workbook part ('" + r->target + "' is missing)");
            return part;
        }
    }
    // Some producers leave the package relationships out: take the usual place.
    std::string part = source_->Find("xl/workbook.xml");
    if (part.empty()) Fail(kBadFile, "the package has no workbook part");
    return part;
}

void Document::Load(std::unique_ptr<PackageSource> source)
{
    source_ = std::move(source);
    std::string types = source_->Find(kContentTypesPart);
    if (types.empty()) Fail(kBadFile, "not a workbook package: it has no content types part");
    contentTypesText_ = ReadPart(types);
    contentTypes_ = ContentTypes::Parse(contentTypesText_);

    workbookPart_ = FindWorkbookPart();
    WorkbookPart wb = WorkbookPart::Parse(ReadPart(workbookPart_), workbookPart_);
    mainNs_ = wb.mainNs;
    date1904_ = wb.date1904;

    workbookRelsPart_ = RelsPartOf(workbookPart_);
    std::string relsEntry = source_->Find(workbookRelsPart_);
    if (!relsEntry.empty()) {
        workbookRelsPart_ = relsEntry;
        workbookRelsText_ = ReadPart(relsEntry);
        workbookRels_ = Relationships::Parse(workbookRelsText_, relsEntry);
    }
    auto partOf = [&](const Relationship &r) {
        if (r.external) Fail(kBadFile, "relationship '" + r.id + "' points outside the package");
        return source_->Find(ResolveTarget(workbookPart_, r.target));
    };

    if (const Relationship *r = workbookRels_.ByKind("sharedStrings")) {
        sharedStringsPart_ = partOf(*r);
        if (!sharedStringsPart_.empty()) {
            sharedStrings_ = SharedStrings::Parse(ReadPart(sharedStringsPart_), sharedStringsPart_, pool_);
            poolSharedCount_ = sharedCount_ = sharedStrings_.Count();
        }
    }
    if (const Relationship *r = workbookRels_.ByKind("styles")) {
        stylesPart_ = partOf(*r);
        if (!stylesPart_.empty()) styles_ = Styles::Parse(ReadPart(stylesPart_), stylesPart_);
    }
    if (stylesPart_.empty()) styles_ = Styles::Default();

    uint64_t sheetBytes = 0;
    for (const SheetEntry &s : wb.sheets) {
        const Relationship *r = workbookRels_.ById(s.relId);
        if (!r) Fail(kBadFile, "sheet '" + s.name + "' has no relationship in the workbook");
        const std::string_view kind = RelationshipKind(r->type);
        const bool worksheet = kind == "worksheet";
        const std::string kindName = kind.ends_with("acrosheet") ? "macrosheet" : std::string(kind);
        tabs_.push_back(SheetTab{s.name, kindName, s.state, worksheet ? int32_t(sheets_.size() + 1) : 0});
        if (!worksheet) continue;  // chart sheets and the like
        std::string part = partOf(*r);
        if (part.empty()) Fail(kBadFile, "the part of sheet '" + s.name + "' is missing ('" + r->target + "')");
        WorksheetEntry entry;
        entry.name = s.name;
        entry.part = part;
        sheets_.push_back(std::move(entry));
        // Sheets that all name one huge part would add up unseen: each
        // naming counts, before anything inflates.
        sheetBytes += source_->InflatedSizeBound(part);
        if (sheetBytes > limits::kMaxWorkbookBytes)
            Fail(kBadFile, "the sheets' parts inflate to more than " +
                               std::to_string(limits::kMaxWorkbookBytes >> 30) +
                               " GiB together (a part that several sheets name counts for each)");
    }
}

WorksheetEntry &Document::Worksheet(size_t index)
{
    WorksheetEntry &sheet = sheets_.at(index);
    if (!sheet.loaded) LoadWorksheet(index);
    return sheet;
}

void Document::ReadWorksheet(size_t index)
{
    uint64_t otherCells = 0;
    for (const WorksheetEntry &other : sheets_)
        if (other.loaded) otherCells += other.model.store.CellCount();
    WorksheetEntry &sheet = sheets_[index];
    SheetContext ctx{pool_, poolSharedCount_, date1904_, limits::kMaxCellsPerWorkbook - otherCells};
    sheet.model = ReadSheet(*source_, sheet.part, ctx);
    sheet.loaded = true;
    // Shared formulas are the sheet's own: with nothing to compute, their
    // masters aren't needed.
    if (sheet.model.formulasWithoutResult.empty()) std::vector<FormulaSource>().swap(sheet.model.sharedMasters);
}

void Document::LoadWorksheet(size_t index)
{
    std::vector<size_t> read;
    try {
        ReadWorksheet(index);
        read.push_back(index);
        if (!sheets_[index].model.formulasWithoutResult.empty()) {
            for (size_t i = 0; i < sheets_.size(); ++i)
                if (!sheets_[i].loaded) ReadWorksheet(i), read.push_back(i);
            ComputeFormulas();
        }
    } catch (const automation::ComError &e) {
        // Sheets read in vain are read again, and fail alike, when next asked for.
        for (size_t i : read) sheets_[i].model = SheetModel(), sheets_[i].loaded = false;
        if (path_.empty()) throw;
        throw automation::ComError(e.Code(), path_ + ": " + e.what());
    }
}

void Document::ComputeFormulas()
{
    std::vector<NamedSheet> named;
    for (WorksheetEntry &sheet : sheets_) named.push_back(NamedSheet{sheet.name, &sheet.model});  // all loaded
    ComputeFormulasWithoutResult(named, pool_, date1904_);
    // What computing needed of the formulas' texts is no longer needed.
    for (WorksheetEntry &sheet : sheets_) {
        std::vector<FormulaSource>().swap(sheet.model.formulasWithoutResult);
        std::vector<FormulaSource>().swap(sheet.model.sharedMasters);
    }
}

void Document::ClearWorksheet(size_t index)
{
    WorksheetEntry &sheet = Worksheet(index);
    const std::string text = sheet.base ? sheet.base->ReadAll(sheet.part) : ReadPart(sheet.part);
    ClearedSheetPart cleared = ClearSheetPart(text, sheet.model.layout, sheet.part, sheet.name);

    // The sheet's relationships to what goes, and the parts only they named.
    const std::string relsPart = source_->Find(RelsPartOf(sheet.part));
    std::string relsText;
    std::vector<std::string> candidates;
    if (!relsPart.empty() && !removedParts_.count(relsPart)) {
        auto edited = editedRels_.find(relsPart);
        const std::string oldText = edited != editedRels_.end() ? edited->second : ReadPart(relsPart);
        const Relationships rels = Relationships::Parse(oldText, relsPart);
        std::set<std::string> dropped;
        for (const Relationship &r : rels.Items()) {
            if (!cleared.relIds.count(r.id) && !GoesWithSheetContent(r.type)) continue;
            dropped.insert(r.id);
            if (r.external) continue;
            std::string part = source_->Find(ResolveTarget(sheet.part, r.target));
            if (!part.empty()) candidates.push_back(std::move(part));
        }
        relsText = dropped.empty() ? oldText : rels.Without(oldText, dropped);
    }
    std::map<std::string, std::string> editedRels = editedRels_;
    if (!relsPart.empty()) editedRels[relsPart] = relsText;
    const std::set<std::string> unused = PartsLeftUnused(*source_, editedRels, removedParts_, std::move(candidates));

    std::unique_ptr<PackageSource> base = PackageSource::FromParts({{sheet.part, std::move(cleared.text)}});
    SheetModel model = ReadSheet(*base, sheet.part, SheetContext{pool_, poolSharedCount_, date1904_});

    // Everything is known and nothing failed: the sheet changes now.
    sheet.model = std::move(model);
    sheet.base = std::move(base);
    editedRels_ = std::move(editedRels);
    removedParts_.insert(unused.begin(), unused.end());
    for (const std::string &part : unused) editedRels_.erase(part);
    Touch(index);
}

void Document::Save()
{
    if (path_.empty()) Fail(kRequestRefused, "the workbook has no file yet: save it with SaveAs");
    SaveAs(path_);
}

void Document::SaveAs(const std::string &path)
{
    if (!convertedFrom_.empty())
        Fail(kRequestRefused, path_ + " is " + convertedFrom_ +
                                  ", which is read but not written: workbooks are written as .xlsx or .xlsm");
    // Texts that changed sheets use and the shared-strings part lacks.
    std::unordered_map<uint32_t, uint32_t> sharedIndexOf = sharedIndexOf_;
    std::vector<std::string_view> addedTexts;
    uint32_t sharedCount = sharedCount_;
    for (const auto &sheet : sheets_) {
        if (!sheet.dirty) continue;
        for (const Row &row : sheet.model.store.Rows())
            for (const Cell &c : row.cells) {
                if (c.kind != CellKind::String || (c.flags & Cell::kHasFormula)) continue;
                uint32_t p = c.StringIndex();
                if (p < poolSharedCount_ || sharedIndexOf.count(p)) continue;
                sharedIndexOf.emplace(p, sharedCount++);
                addedTexts.push_back(pool_.Get(p));
            }
    }
    SheetWriteContext ctx{pool_, [&](uint32_t p) { return p < poolSharedCount_ ? p : sharedIndexOf.at(p); }};

    std::map<std::string, std::string> replaced;
    std::vector<std::pair<std::string, std::string>> addedParts;
    std::vector<SheetLayout> layouts(sheets_.size());
    // Changed sheets are written as the package is put together, each packed
    // as its text is made.
    std::map<std::string, size_t> changedSheets;
    bool cellsChanged = false;
    for (size_t i = 0; i < sheets_.size(); ++i) {
        if (!sheets_[i].dirty) continue;
        changedSheets[sheets_[i].part] = i;
        cellsChanged = true;
    }
    for (const auto &[part, text] : editedRels_) replaced[part] = text;
    if (cellsChanged) {
        // Formulas elsewhere may read the cells that changed: their cached
        // results are computed again when a spreadsheet program opens the file.
        const std::string workbookText = ReadPart(workbookPart_);
        std::string marked = WithFullCalcOnLoad(workbookText, workbookPart_);
        if (marked != workbookText) replaced[workbookPart_] = std::move(marked);
    }

    std::string typesText = contentTypesText_;
    if (!removedParts_.empty()) typesText = ContentTypes::Parse(typesText).WithoutOverrides(typesText, removedParts_);
    // A spreadsheet program opens an .xlsm only when its workbook part says
    // it may hold macros; a workbook made here says it doesn't.
    if (IsMacroWorkbookName(path)) {
        const std::string plain = std::string("ContentType=\"") + content_type::kWorkbook + "\"";
        if (const size_t at = typesText.find(plain); at != std::string::npos)
            typesText.replace(at, plain.size(), std::string("ContentType=\"") + content_type::kMacroWorkbook + "\"");
    }
    std::string relsText = workbookRelsText_;
    auto addPart = [&](const char *kind, const char *contentType, const std::string &name, std::string bytes) {
        std::string part = FolderOf(workbookPart_) + name;
        addedParts.emplace_back(part, std::move(bytes));
        Relationship r{Relationships::Parse(relsText, workbookRelsPart_).NewId(),
                       std::string(ns::RelTypeBase(mainNs_)) + kind, TargetFor(workbookPart_, part), false};
        relsText = relsText.empty() ? Relationships::Compose({r})
                                    : Relationships::Parse(relsText, workbookRelsPart_).Added(relsText, r);
        if (!ContentTypes::Parse(typesText).HasOverride(part))
            typesText = ContentTypes::Parse(typesText).WithOverride(typesText, part, contentType);
        return part;
    };

    std::string sharedStringsPart = sharedStringsPart_;
    std::string stylesPart = stylesPart_;
    if (!addedTexts.empty()) {
        if (!sharedStringsPart.empty())
            replaced[sharedStringsPart] = sharedStrings_.WithAdded(ReadPart(sharedStringsPart), addedTexts);
        else
            sharedStringsPart = addPart("sharedStrings", content_type::kSharedStrings, "sharedStrings.xml",
                                        SharedStrings::Compose(mainNs_, addedTexts));
    }
    if (styles_.Changed()) {
        if (!stylesPart.empty())
            replaced[stylesPart] = styles_.Write(ReadPart(stylesPart));
        else
            stylesPart = addPart("styles", content_type::kStyles, "styles.xml", styles_.Compose(mainNs_));
    }
    bool relsAdded = relsText != workbookRelsText_ && workbookRelsText_.empty();
    if (relsText != workbookRelsText_ && !relsAdded) replaced[workbookRelsPart_] = relsText;
    if (relsAdded) addedParts.emplace_back(workbookRelsPart_, relsText);
    if (typesText != contentTypesText_) replaced[source_->Find(kContentTypesPart)] = typesText;

    // What the workbook keeps of the parts it writes is read from their texts
    // now: once the file is replaced, nothing may fail for what was written.
    auto newText = [&](const std::string &part) -> std::string_view {
        if (auto it = replaced.find(part); it != replaced.end()) return it->second;
        for (const auto &[name, bytes] : addedParts)
            if (name == part) return bytes;
        return {};
    };
    std::optional<SharedStrings> savedStrings;
    if (!addedTexts.empty()) {
        StringPool scratch;
        savedStrings = SharedStrings::Parse(newText(sharedStringsPart), sharedStringsPart, scratch);
    }
    std::optional<Styles> savedStyles;
    if (styles_.Changed()) {
        savedStyles = styles_;
        savedStyles->Rebase(newText(stylesPart), stylesPart);
    }

    ZipBuilder zip;
    for (const auto &name : source_->EntryNames()) {
        if (removedParts_.count(name)) continue;
        if (auto changed = changedSheets.find(name); changed != changedSheets.end()) {
            const WorksheetEntry &sheet = sheets_[changed->second];
            const PackageSource &from = sheet.base ? *sheet.base : *source_;
            zip.AddMade(name, [&](const PieceSink &sink) {
                WriteSheet(from, sheet.part, sheet.model, ctx, layouts[changed->second], sink);
            });
            continue;
        }
        auto it = replaced.find(name);
        if (it != replaced.end())
            zip.AddBytes(name, std::move(it->second));
        else
            zip.AddCopy(*source_, name);
    }
    for (auto &[name, bytes] : addedParts) zip.AddBytes(name, std::move(bytes));
    ReplaceFileAtomically(path, zip.Finish());

    // The file is written: the workbook now stands on it.
    std::unique_ptr<PackageSource> saved = PackageSource::OpenFile(path);
    source_ = std::move(saved);
    path_ = path;
    sharedIndexOf_ = std::move(sharedIndexOf);
    sharedCount_ = sharedCount;
    sharedStringsPart_ = sharedStringsPart;
    if (savedStrings) sharedStrings_ = std::move(*savedStrings);
    stylesPart_ = stylesPart;
    if (savedStyles) styles_ = std::move(*savedStyles);
    contentTypesText_ = typesText;
    contentTypes_ = ContentTypes::Parse(contentTypesText_);
    workbookRelsText_ = relsText;
    if (!relsText.empty()) workbookRels_ = Relationships::Parse(relsText, workbookRelsPart_);
    for (size_t i = 0; i < sheets_.size(); ++i) {
        if (!sheets_[i].dirty) continue;
        sheets_[i].model.layout = layouts[i];
        sheets_[i].dirty = false;
        sheets_[i].base.reset();
    }
    editedRels_.clear();
    removedParts_.clear();
}

}  // namespace workbook
