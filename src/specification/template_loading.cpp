// SPDX-License-Identifier: MIT
// Loading a template file into a record for the bridge, and recognising a
// specification string that names a template instead of holding settings.
#include <string>

#include "module/string_table.h"
#include "specification/specification.h"
#include "specification/tokenizer.h"
#include "specification/xml_template_doc.h"

namespace {

constexpr int kStringShortSchema = 101;
constexpr int kStringLongSchemaHead = 103;
constexpr int kStringLongSchemaTail = 104;

constexpr int kMessageNotValid = 134;
constexpr int kMessageCannotOpen = 135;
constexpr int kMessageCannotInitialise = 136;
constexpr int kMessageDataNotValid = 143;

bool Fail(std::string &error, int message)
{
    error = vantrel::LoadMessage(message);
    return false;
}

}  // namespace

bool CSpecification::GetTemplateReference(const std::string &spec, std::string &path) const
{
    const auto pieces = vantrel::SplitPieces(spec, ";");
    if (pieces.empty() || pieces[0].find("TemplateFilePath") == std::string_view::npos)
        return false;
    const auto tokens = vantrel::SplitPieces(pieces[0], "=");
    path = tokens.size() > 1 ? std::string(tokens[1]) : std::string();
    return true;
}

bool CSpecification::LoadOpenTemplate(const std::string &path, OpenSpecification &record,
                                      std::string &error)
{
    CXmlTemplateDoc document;
    if (!document.InitDocument()) return Fail(error, kMessageCannotInitialise);
    if (!document.LoadFile(path)) return Fail(error, kMessageCannotOpen);
    const std::string schema =
        vantrel::LoadMessage(kStringLongSchemaHead) + vantrel::LoadMessage(kStringLongSchemaTail);
    if (!document.ValidateSchema(schema, error)) return Fail(error, kMessageNotValid);
    ReadOpenTemplate(document, record);
    if (!CheckOpenSpecification(record)) return Fail(error, kMessageDataNotValid);
    return true;
}

bool CSpecification::LoadSaveTemplate(const std::string &path, SaveSpecification &record,
                                      std::string &error)
{
    CXmlTemplateDoc document;
    if (!document.InitDocument()) return Fail(error, kMessageCannotInitialise);
    if (!document.LoadFile(path)) return Fail(error, kMessageCannotOpen);
    if (!document.ValidateSchema(vantrel::LoadMessage(kStringShortSchema), error))
        return Fail(error, kMessageNotValid);
    // The reader's own result is no verdict: the rows check decides.
    ReadSaveTemplate(document, record);
    return CheckSaveRows(record, error);
}
