// SPDX-License-Identifier: MIT
// The connection of a series: the workbook path, the specification string and
// the silent flag.
#pragma once

#include <optional>
#include <string>

#include "com_object.h"
#include "hostseries/hostseries.h"

namespace hostseries::detail {

class Connection final : public ComObject<IHostConnection> {
public:
    Connection() noexcept : ComObject(IID_IHostConnection) {}

    HRESULT GetFilePath(BSTR *path) override;
    HRESULT SetFilePath(BSTR path) override;
    HRESULT GetSpecification(BSTR *specification) override;
    HRESULT SetSpecification(BSTR specification) override;
    HRESULT GetSilent(VARIANT_BOOL *silent) override;

    // Only a host sets the flag; until it does, GetSilent leaves the caller's preset.
    void SetSilentByHost(VARIANT_BOOL silent) noexcept;

private:
    // Texts are kept in UTF-16 exactly as they came, embedded zeros included.
    std::u16string path_;
    std::u16string specification_;
    std::optional<VARIANT_BOOL> silent_;
};

}  // namespace hostseries::detail
