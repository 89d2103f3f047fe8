// SPDX-License-Identifier: MIT
// BSTR: UTF-16 text preceded by its length in bytes (32 bits) and followed by
// a 16-bit zero. The pointer handed out points at the text.
#include <cstdint>
#include <cstdlib>
#include <cstring>

#include "automation/automation.h"

namespace {

constexpr size_t kPrefix = sizeof(uint32_t);
constexpr size_t kTerminator = sizeof(OLECHAR);
// The byte count must fit the prefix with room for the terminator.
constexpr size_t kMaxBytes = UINT32_MAX - kPrefix - kTerminator;

char *Block(BSTR bstr) { return reinterpret_cast<char *>(bstr) - kPrefix; }

// A new BSTR of byteCount bytes, all of them zero, terminated.
BSTR AllocBytes(size_t byteCount)
{
    if (byteCount > kMaxBytes) return nullptr;
    // One more byte than strictly needed keeps an odd byte count terminated
    // by a whole 16-bit zero.
    char *block = static_cast<char *>(std::calloc(1, kPrefix + byteCount + kTerminator + 1));
    if (!block) return nullptr;
    const auto count = static_cast<uint32_t>(byteCount);
    std::memcpy(block, &count, sizeof count);
    return reinterpret_cast<BSTR>(block + kPrefix);
}

size_t TextLength(const OLECHAR *psz)
{
    size_t n = 0;
    while (psz[n] != 0) ++n;
    return n;
}

BSTR AllocCopy(const OLECHAR *text, size_t length)
{
    if (length > kMaxBytes / sizeof(OLECHAR)) return nullptr;
    BSTR b = AllocBytes(length * sizeof(OLECHAR));
    if (b && text && length) std::memcpy(b, text, length * sizeof(OLECHAR));
    return b;
}

}  // namespace

AUTOMATION_API BSTR SysAllocString(const OLECHAR *psz)
{
    return psz ? AllocCopy(psz, TextLength(psz)) : nullptr;
}

// A null source gives ui zero characters.
AUTOMATION_API BSTR SysAllocStringLen(const OLECHAR *strIn, UINT ui)
{
    return AllocCopy(strIn, ui);
}

// A null source gives len zero bytes.
AUTOMATION_API BSTR SysAllocStringByteLen(const char *psz, UINT len)
{
    BSTR b = AllocBytes(len);
    if (b && psz && len) std::memcpy(b, psz, len);
    return b;
}

// Copies before freeing, so the new text may lie inside the old string.
AUTOMATION_API INT SysReAllocString(BSTR *pbstr, const OLECHAR *psz)
{
    if (!pbstr) return FALSE;
    if (!psz) {
        SysFreeString(*pbstr);
        *pbstr = nullptr;
        return TRUE;
    }
    return SysReAllocStringLen(pbstr, psz, static_cast<UINT>(TextLength(psz)));
}

// With a null psz the old text is kept as far as it reaches, and the rest of
// the len characters is zero.
AUTOMATION_API INT SysReAllocStringLen(BSTR *pbstr, const OLECHAR *psz, UINT len)
{
    if (!pbstr) return FALSE;
    const OLECHAR *source = psz;
    size_t sourceLength = len;
    if (!psz && *pbstr) {
        source = *pbstr;
        sourceLength = SysStringLen(*pbstr) < len ? SysStringLen(*pbstr) : len;
    }
    BSTR fresh = AllocCopy(nullptr, len);
    if (!fresh) return FALSE;
    if (source && sourceLength) std::memcpy(fresh, source, sourceLength * sizeof(OLECHAR));
    SysFreeString(*pbstr);
    *pbstr = fresh;
    return TRUE;
}

AUTOMATION_API void SysFreeString(BSTR bstrString)
{
    if (bstrString) std::free(Block(bstrString));
}

AUTOMATION_API UINT SysStringByteLen(BSTR bstr)
{
    if (!bstr) return 0;
    uint32_t count;
    std::memcpy(&count, Block(bstr), sizeof count);
    return count;
}

AUTOMATION_API UINT SysStringLen(BSTR pbstr)
{
    return SysStringByteLen(pbstr) / sizeof(OLECHAR);
}
