// SPDX-License-Identifier: MIT
// Interface identifiers and the braced text of a GUID.
#include "automation/guid.h"

#include <cstdio>

AUTOMATION_API const IID IID_IUnknown = {0x00000000, 0x0000, 0x0000,
                                         {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
AUTOMATION_API const IID IID_IClassFactory = {0x00000001, 0x0000, 0x0000,
                                              {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
AUTOMATION_API const IID IID_IDispatch = {0x00020400, 0x0000, 0x0000,
                                          {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
AUTOMATION_API const IID IID_IErrorInfo = {0x1CF2B120, 0x547D, 0x101B,
                                           {0x8E, 0x65, 0x08, 0x00, 0x2B, 0x2B, 0xD1, 0x19}};
AUTOMATION_API const IID IID_ICreateErrorInfo = {
    0x22F03340, 0x547D, 0x101B, {0x8E, 0x65, 0x08, 0x00, 0x2B, 0x2B, 0xD1, 0x19}};
AUTOMATION_API const IID IID_ISupportErrorInfo = {
    0xDF0B3D60, 0x548F, 0x101B, {0x8E, 0x65, 0x08, 0x00, 0x2B, 0x2B, 0xD1, 0x19}};
AUTOMATION_API const IID IID_NULL = {0, 0, 0, {0, 0, 0, 0, 0, 0, 0, 0}};

namespace {

constexpr size_t kGuidTextLength = 38;  // without the terminating zero

int HexValue(OLECHAR c)
{
    if (c >= u'0' && c <= u'9') return c - u'0';
    if (c >= u'A' && c <= u'F') return c - u'A' + 10;
    if (c >= u'a' && c <= u'f') return c - u'a' + 10;
    return -1;
}

// Reads digits hex digits at text[pos]; false if any is no hex digit.
bool ReadHex(LPCOLESTR text, size_t pos, int digits, uint32_t &value)
{
    value = 0;
    for (int i = 0; i < digits; ++i) {
        const int digit = HexValue(text[pos + i]);
        if (digit < 0) return false;
        value = value << 4 | static_cast<uint32_t>(digit);
    }
    return true;
}

}  // namespace

namespace automation {

std::string GuidToString(const GUID &g)
{
    char buffer[kGuidTextLength + 1];
    std::snprintf(buffer, sizeof buffer, "{%08X-%04X-%04X-%02X%02X-%02X%02X%02X%02X%02X%02X}",
                  g.Data1, g.Data2, g.Data3, g.Data4[0], g.Data4[1], g.Data4[2], g.Data4[3],
                  g.Data4[4], g.Data4[5], g.Data4[6], g.Data4[7]);
    return buffer;
}

}  // namespace automation

AUTOMATION_API INT StringFromGUID2(REFGUID rguid, LPOLESTR lpsz, INT cchMax)
{
    if (!lpsz || cchMax < static_cast<INT>(kGuidTextLength + 1)) return 0;
    const std::string text = automation::GuidToString(rguid);
    for (size_t i = 0; i < text.size(); ++i) lpsz[i] = static_cast<OLECHAR>(text[i]);
    lpsz[kGuidTextLength] = 0;
    return static_cast<INT>(kGuidTextLength + 1);
}

// Only the braced form is read (either case of hex digits); there is no
// registry of ProgIDs. Malformed text gives CO_E_CLASSSTRING.
AUTOMATION_API HRESULT CLSIDFromString(LPCOLESTR lpsz, CLSID *pclsid)
{
    if (!lpsz || !pclsid) return E_INVALIDARG;
    static constexpr size_t kDashes[] = {9, 14, 19, 24};
    size_t length = 0;
    while (length <= kGuidTextLength && lpsz[length] != 0) ++length;
    if (length != kGuidTextLength || lpsz[0] != u'{' || lpsz[37] != u'}') return CO_E_CLASSSTRING;
    for (size_t dash : kDashes)
        if (lpsz[dash] != u'-') return CO_E_CLASSSTRING;

    GUID g{};
    uint32_t part;
    if (!ReadHex(lpsz, 1, 8, part)) return CO_E_CLASSSTRING;
    g.Data1 = part;
    if (!ReadHex(lpsz, 10, 4, part)) return CO_E_CLASSSTRING;
    g.Data2 = static_cast<uint16_t>(part);
    if (!ReadHex(lpsz, 15, 4, part)) return CO_E_CLASSSTRING;
    g.Data3 = static_cast<uint16_t>(part);
    static constexpr size_t kBytePositions[] = {20, 22, 25, 27, 29, 31, 33, 35};
    for (size_t i = 0; i < 8; ++i) {
        if (!ReadHex(lpsz, kBytePositions[i], 2, part)) return CO_E_CLASSSTRING;
        g.Data4[i] = static_cast<uint8_t>(part);
    }
    *pclsid = g;
    return S_OK;
}
