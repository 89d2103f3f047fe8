// SPDX-License-Identifier: MIT
#include <functional>
#include <thread>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/com_ptr.h"
#include "expect_hr.h"

namespace {

// Apartments belong to threads: each case starts on a thread of its own.
void OnFreshThread(const std::function<void()> &body) { std::thread(body).join(); }

TEST(AutomationApartment, CountsAndModels)
{
    OnFreshThread([] {
        EXPECT_HR(S_OK, CoInitialize(nullptr));
        EXPECT_HR(S_FALSE, CoInitialize(nullptr));
        EXPECT_HR(S_FALSE, CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED));
        EXPECT_HR(RPC_E_CHANGED_MODE, CoInitializeEx(nullptr, COINIT_MULTITHREADED));
        CoUninitialize();
        CoUninitialize();
        EXPECT_HR(RPC_E_CHANGED_MODE, CoInitializeEx(nullptr, COINIT_MULTITHREADED))
            << "the refused call was not counted, one call is still open";
        CoUninitialize();
        // All closed: the thread may choose again.
        EXPECT_HR(S_OK, CoInitializeEx(nullptr, COINIT_MULTITHREADED));
        EXPECT_HR(RPC_E_CHANGED_MODE, CoInitialize(nullptr));
        CoUninitialize();
        CoUninitialize();  // one too many does no harm
        EXPECT_HR(S_OK, CoInitialize(nullptr));
        CoUninitialize();
    });
}

TEST(AutomationApartment, ThreadsAreIndependent)
{
    OnFreshThread([] {
        EXPECT_HR(S_OK, CoInitializeEx(nullptr, COINIT_MULTITHREADED));
        OnFreshThread([] {
            EXPECT_HR(S_OK, CoInitialize(nullptr));
            CoUninitialize();
        });
        CoUninitialize();
    });
}

TEST(AutomationApartment, OddArguments)
{
    OnFreshThread([] {
        int reserved = 0;
        EXPECT_HR(E_INVALIDARG, CoInitialize(&reserved));
        EXPECT_HR(E_INVALIDARG, CoInitializeEx(nullptr, 0x100));
        EXPECT_HR(S_OK, CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED | 0x4));
        CoUninitialize();
    });
}

TEST(AutomationApartment, LastUninitializeDropsErrorInfo)
{
    OnFreshThread([] {
        ICreateErrorInfo *create = nullptr;
        ASSERT_HR(S_OK, CreateErrorInfo(&create));
        IErrorInfo *info = nullptr;
        ASSERT_HR(S_OK, create->QueryInterface(IID_IErrorInfo, reinterpret_cast<void **>(&info)));
        create->Release();

        EXPECT_HR(S_OK, CoInitialize(nullptr));
        EXPECT_HR(S_FALSE, CoInitialize(nullptr));
        ASSERT_HR(S_OK, SetErrorInfo(0, info));
        CoUninitialize();
        info->AddRef();
        EXPECT_EQ(info->Release(), 2u) << "still held while one call is open";
        CoUninitialize();
        info->AddRef();
        EXPECT_EQ(info->Release(), 1u) << "released by the last CoUninitialize";
        IErrorInfo *none = nullptr;
        EXPECT_HR(S_FALSE, GetErrorInfo(0, &none));
        info->Release();
    });
}

}  // namespace
