// SPDX-License-Identifier: MIT
#include "module/string_table.h"

#include <cstdarg>
#include <cstdio>
#include <unordered_map>
#include <vector>

namespace vantrel {
namespace {

const std::unordered_map<int, const char *> &Table()
{
    static const std::unordered_map<int, const char *> table = {
        {kStringBridgeKeyName, "ExcelVantrel"},
        {kStringApplicationTitle, "Excel Vantrel"},
        // The template schemas: the short one takes the save template alone; the
        // long one, 103 and 104 joined, the open template and its extension.
        {101,
         "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
         "<xs:schema xmlns:xs=\"http://www.w3.org/2001/XMLSchema\">\n"
         "  <xs:element name=\"MSExcelVantrelSpecification\">\n"
         "    <xs:complexType>\n"
         "      <xs:attribute name=\"DateTimeCol\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseDTFormat\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"DateTimeFormat\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"UnitTypeRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UnitRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"ValueTypeRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"ItemDescriptionRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"StartRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseDelValNotEmpty\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"DeleteValueRow\" type=\"xs:int\"/>\n"
         "    </xs:complexType>\n"
         "  </xs:element>\n"
         "</xs:schema>\n"},
        {103,
         "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
         "<xs:schema xmlns:xs=\"http://www.w3.org/2001/XMLSchema\">\n"
         "  <xs:element name=\"MSExcelVantrelSpecification\">\n"
         "    <xs:complexType>\n"
         "      <xs:sequence>\n"
         "        <xs:element name=\"MSExcelVantrelSpecificationExtension\" minOccurs=\"0\">\n"
         "          <xs:complexType>\n"
         "            <xs:sequence>\n"
         "            <xs:element name=\"ItemTitles\" minOccurs=\"0\">\n"
         "              <xs:complexType>\n"
         "                <xs:sequence>\n"
         "                  <xs:element name=\"ItemTitle\" type=\"xs:string\" maxOccurs=\"unbounded\"/>\n"
         "                </xs:sequence>\n"
         "              </xs:complexType>\n"
         "            </xs:element>\n"
         "            <xs:element name=\"ItemTypes\" minOccurs=\"0\">\n"
         "              <xs:complexType>\n"
         "                <xs:sequence>\n"
         "                  <xs:element name=\"ItemType\" type=\"xs:string\" maxOccurs=\"unbounded\"/>\n"
         "                </xs:sequence>\n"
         "              </xs:complexType>\n"
         "            </xs:element>\n"
         "            <xs:element name=\"ItemUnits\" minOccurs=\"0\">\n"
         "              <xs:complexType>\n"
         "                <xs:sequence>\n"
         "                  <xs:element name=\"ItemUnit\" type=\"xs:string\" maxOccurs=\"unbounded\"/>\n"
         "                </xs:sequence>\n"
         "              </xs:complexType>\n"
         "            </xs:element>\n"
         "            <xs:element name=\"ValueTypes\" minOccurs=\"0\">\n"
         "              <xs:complexType>\n"
         "                <xs:sequence>\n"
         "                  <xs:element name=\"ValueType\" type=\"xs:string\" maxOccurs=\"unbounded\"/>\n"
         "                </xs:sequence>\n"
         "              </xs:complexType>\n"
         "            </xs:element>\n"
         "            </xs:sequence>\n"
         "          </xs:complexType>\n"
         "        </xs:element>\n"
         "      </xs:sequence>\n"
         "      <xs:attribute name=\"ExcelSheet\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"DataTimeType\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"DateTimeCol\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseDTFormat\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"DateTimeFormat\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"GlobalDate\" type=\"xs:date\"/>\n"
         "      <xs:attribute name=\"TimeCol\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseTFormat\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"GlobalTime\" type=\"xs:time\"/>\n"
         "      <xs:attribute name=\"TimeFormat\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"DateCol\" type=\"xs:int\"/>\n"},
        {104,
         "      <xs:attribute name=\"UseDFormat\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"DateFormat\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"UseUnitTypeRow\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"GlobalUnitType\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"UnitTypeRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseUnitRow\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"GlobalUnit\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"UnitRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseValueTypeRow\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"GlobalValueType\" type=\"xs:string\"/>\n"
         "      <xs:attribute name=\"ValueTypeRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"ItemDescriptionRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"StartRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseDelValNotEmpty\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"UseDeleteValueRow\" type=\"xs:boolean\"/>\n"
         "      <xs:attribute name=\"DeleteValue\" type=\"xs:double\"/>\n"
         "      <xs:attribute name=\"DeleteValueRow\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseUnitTypeOption\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseUnitOption\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseValueTypeOption\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"UseItemTitleOption\" type=\"xs:int\"/>\n"
         "      <xs:attribute name=\"SelItems\" type=\"xs:string\"/>\n"
         "    </xs:complexType>\n"
         "  </xs:element>\n"
         "</xs:schema>\n"},
        {106, "The sheets don't share the same date/time."},
        {107, "The date and time is not in ascending order - error at time step %d."},
        {109, "There should be 2 columns at least in sheet %d."},
        {110, "There is no date/time in the row %d."},
        {111, "The value type is not valid."},
        {112, "The unit type or unit is not valid."},
        {113, "Can not parse the date time in row %d, column %d."},
        {114, "There is an error in the date or time data. Dates and times must always increase"},
        {115, "The data start row needs to be greater than any heading rows. Please correct this "
              "to continue."},
        {116, "The item description row should not equal any of the other header rows. Please "
              "correct this to continue."},
        {117, "The data value in file is not corresponding to Date/Time format."},
        {118, "The Date/Time format is not supported."},
        {119, "Could not locate Excel. Please verify that MS Excel has been installed correctly."},
        {120, "Excel could not create file"},
        {121, "Excel Workbook could not open file."},
        {122, "The sheet index is greater than the total number of sheets in the file."},
        {124, "There is an error in the date/time at: (%s). Dates and times must always increase."},
        {125, "Date/Time Field needs to be of type DATE in row %d, column %d."},
        {126, "The Date/Time value (starting at Row %d)  is invalid."},
        {127, "Line %d, Column %d - Only double values are allowed as item data."},
        {128, "XML Document is invalid.\n\nReason:\n"},
        {129, "Please enter the correct template file."},
        {130, "The template file path is required."},
        {131, "Please specify the path of the output file."},
        {132, "Please specify the path of the output template file."},
        {133, "Wrong number of the Data start row."},
        {134, "The xml File is not valid."},
        {135, "Can not Open the xml file."},
        {136, "Can not initialize the xml"},
        {137, "Row numbers cannot be negative"},
        {139, "Please enter the correct file."},
        {140, "Only the letters 'Y','y', 'M','m', 'D','d','H','h' are allowed when specifying "
              "the date/time format."},
        {141, "Preview dialog can not get the No. %d sheet"},
        {142, "There is no data in the given sheet."},
        {143, "The data in the xml File is not valid."},
        {144, "TS Import error: incorrect data format detected in line %d."},
        // The open dialog's own messages.
        {145, "The sheet list \"%s\" names no sheet to preview. Use sheet numbers from 1 to 10, a "
              "range like 2-4, or all."},
        {146, "Please enter a whole number in \"%s\"."},
        {147, "Please enter a number in \"%s\"."},
        {148, "The open dialog needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, "
              "or name a Qt platform in QT_QPA_PLATFORM."},
        {149, "The open dialog needs a Qt widget application, but the host runs Qt without widgets."},
        {150, "The units catalogue holds no item type, so the data page has none to offer."},
        {152, "The save dialog needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, or name a Qt "
              "platform in QT_QPA_PLATFORM."},
        {153, "The save dialog needs a Qt widget application, but the host runs Qt without widgets."},
        {154, "The %s dialog needs a display, but the X display \"%s\" named in DISPLAY doesn't answer."},
        {155, "The sheet list names more than %d sheets; name fewer."},
    };
    return table;
}

}  // namespace

std::string LoadMessage(int id)
{
    const auto &table = Table();
    const auto it = table.find(id);
    return it == table.end() ? std::string() : std::string(it->second);
}

std::string FormatMessage(int id, ...)
{
    const std::string format = LoadMessage(id);
    va_list args;
    va_start(args, id);
    va_list measure;
    va_copy(measure, args);
    const int length = std::vsnprintf(nullptr, 0, format.c_str(), measure);
    va_end(measure);
    std::string text;
    if (length > 0) {
        std::vector<char> buffer(static_cast<size_t>(length) + 1);
        std::vsnprintf(buffer.data(), buffer.size(), format.c_str(), args);
        text.assign(buffer.data(), static_cast<size_t>(length));
    }
    va_end(args);
    return text;
}

}  // namespace vantrel
