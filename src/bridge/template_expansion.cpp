// SPDX-License-Identifier: MIT
// A host may name a template instead of giving the settings: a string whose
// first piece holds "TemplateFilePath". The template is then loaded once, its
// settings replace the string in the host object, and the reference is gone.
#include <string>

#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "bridge/host_calls.h"
#include "specification/specification.h"

namespace {

void StoreSpecification(IHostConnection &connection, const std::string &spec)
{
    vantrel::bridge::HostCall(connection.SetSpecification(automation::Bstr(spec).Get()), "SetSpecification");
}

}  // namespace

bool CExcelVantrel::ExpandOpenTemplate(IHostConnection &connection, std::string &spec)
{
    CSpecification specification;
    std::string path;
    if (!specification.GetTemplateReference(spec, path) || path.empty()) return true;

    OpenSpecification record;
    std::string error;
    const bool loaded = specification.LoadOpenTemplate(path, record, error);
    if (loaded) {
        specification.OpenSpecificationToString(record, spec);
    } else {
        m_report.TemplateNotLoaded(path, error);
        if (!error.empty()) ShowMessage(error);
    }
    // The lists go to the run even from a template that failed its checks.
    m_itemTitles = specification.ItemTitles;
    m_itemTypes = specification.ItemTypes;
    m_itemUnits = specification.ItemUnits;
    m_valueTypes = specification.ValueTypes;
    m_selectedItems = "SelItems=" + specification.SelItems;
    StoreSpecification(connection, spec);
    return loaded;
}

bool CExcelVantrel::ExpandSaveTemplate(IHostConnection &connection, std::string &spec, std::string &message)
{
    CSpecification specification;
    std::string path;
    if (spec.empty()) {
        // An export needs no settings: the default layout stands in.
        specification.SaveSpecificationToString(SaveSpecification(), spec);
    } else if (specification.GetTemplateReference(spec, path) && !path.empty()) {
        SaveSpecification record;
        if (!specification.LoadSaveTemplate(path, record, message)) {
            if (message.empty()) message = "The save template '" + path + "' could not be loaded.";
            return false;
        }
        specification.SaveSpecificationToString(record, spec);
    }
    StoreSpecification(connection, spec);
    return true;
}
