// SPDX-License-Identifier: MIT
// CZerinRegistry: the host's own registry tree, divided into product areas.
// Each area is the key "ProductAreas\<number>" of the registry store's host
// tree (registry/registry.h), and every key path given here is relative to
// it. An object works on one open key at a time.
#pragma once

#include <string>

#include "automation/automation.h"

#define ZERINFL_API __attribute__((visibility("default")))

enum ZerinProductAreas {
    // The area where the host keeps its bridges, under "Bridges".
    ZerinAreaBridges = 4
};

class ZERINFL_API CZerinRegistry {
public:
    // options is reserved and should be 0.
    CZerinRegistry(ZerinProductAreas area, int options);
    ~CZerinRegistry();
    CZerinRegistry(const CZerinRegistry &) = delete;
    CZerinRegistry &operator=(const CZerinRegistry &) = delete;

    // Opens the key at keyPath, making it (and the keys above it) when create
    // is 1. Non-zero when the key is open now; on failure no key is open.
    BOOL Open(const char *keyPath, int create);

    // Stores text as the open key's value; a null or empty name is its
    // default value. Non-zero on success.
    BOOL Write(const char *valueName, const char *text);

    // Reads the open key's value into text. Non-zero on success.
    BOOL Read(const char *valueName, std::string &text) const;

    // Removes the subkey name of the open key with all it holds when
    // recursive is 1; with 0, only a subkey that has no subkeys of its own.
    // Non-zero on success.
    BOOL DeleteKey(const char *name, int recursive);

private:
    std::string areaPath_;
    std::string openKey_;  // the full path in the host tree; empty when none is open
};
