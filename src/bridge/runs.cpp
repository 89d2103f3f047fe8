// SPDX-License-Identifier: MIT
// The runs on an open workbook stand in their own files: the inspection in
// sheet_inspection.cpp, the import in import_read.cpp, the export in
// export_write.cpp.
#include "bridge/excel_vantrel.h"
