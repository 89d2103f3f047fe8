// SPDX-License-Identifier: MIT
#include <thread>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/com_ptr.h"
#include "automation/values.h"
#include "expect_hr.h"

namespace {

using automation::Bstr;
using automation::ComPtr;

// The count that AddRef reports after taking one more reference.
ULONG RefsOf(IUnknown *object)
{
    object->AddRef();
    return object->Release();
}

ComPtr<IErrorInfo> MakeErrorInfo(const char16_t *description)
{
    ComPtr<ICreateErrorInfo> create;
    EXPECT_HR(S_OK, CreateErrorInfo(create.Out()));
    EXPECT_HR(S_OK, create->SetDescription(const_cast<LPOLESTR>(description)));
    ComPtr<IErrorInfo> info;
    EXPECT_HR(S_OK, create.As(IID_IErrorInfo, info));
    return info;
}

TEST(AutomationErrorInfo, OneObjectBehindBothInterfaces)
{
    ComPtr<ICreateErrorInfo> create;
    ASSERT_HR(S_OK, CreateErrorInfo(create.Out()));
    EXPECT_EQ(RefsOf(create.Get()), 1u);

    ComPtr<IErrorInfo> info;
    ASSERT_HR(S_OK, create.As(IID_IErrorInfo, info));
    EXPECT_EQ(RefsOf(info.Get()), 2u);

    ComPtr<IUnknown> fromCreate, fromInfo;
    ASSERT_HR(S_OK, create.As(IID_IUnknown, fromCreate));
    ASSERT_HR(S_OK, info.As(IID_IUnknown, fromInfo));
    EXPECT_EQ(fromCreate.Get(), fromInfo.Get()) << "one IUnknown identity";

    ComPtr<ICreateErrorInfo> again;
    ASSERT_HR(S_OK, info.As(IID_ICreateErrorInfo, again));
    EXPECT_EQ(again.Get(), create.Get());

    void *pv = &pv;
    EXPECT_HR(E_NOINTERFACE, info->QueryInterface(IID_IDispatch, &pv));
    EXPECT_EQ(pv, nullptr);
    EXPECT_HR(E_NOINTERFACE, info->QueryInterface(IID_ISupportErrorInfo, &pv));
    EXPECT_HR(E_POINTER, info->QueryInterface(IID_IUnknown, nullptr));
    EXPECT_HR(E_INVALIDARG, CreateErrorInfo(nullptr));
}

TEST(AutomationErrorInfo, FieldsAreCopied)
{
    ComPtr<ICreateErrorInfo> create;
    ASSERT_HR(S_OK, CreateErrorInfo(create.Out()));
    ComPtr<IErrorInfo> info;
    ASSERT_HR(S_OK, create.As(IID_IErrorInfo, info));

    Bstr text;
    ASSERT_HR(S_OK, info->GetDescription(text.Out()));
    EXPECT_EQ(text.Get(), nullptr) << "a field never set is a null text";
    GUID guid = IID_IDispatch;
    ASSERT_HR(S_OK, info->GetGUID(&guid));
    EXPECT_TRUE(guid == IID_NULL);

    char16_t source[] = u"Source";
    ASSERT_HR(S_OK, create->SetSource(source));
    source[0] = u'X';  // the object keeps its own copy
    ASSERT_HR(S_OK, create->SetDescription(const_cast<LPOLESTR>(u"Something failed")));
    ASSERT_HR(S_OK, create->SetHelpFile(const_cast<LPOLESTR>(u"help.chm")));
    ASSERT_HR(S_OK, create->SetHelpContext(42));
    ASSERT_HR(S_OK, create->SetGUID(IID_IErrorInfo));

    ASSERT_HR(S_OK, info->GetSource(text.Out()));
    EXPECT_EQ(text.Utf8(), "Source");
    ASSERT_HR(S_OK, info->GetDescription(text.Out()));
    EXPECT_EQ(text.Utf8(), "Something failed");
    Bstr second;
    ASSERT_HR(S_OK, info->GetDescription(second.Out()));
    EXPECT_NE(second.Get(), text.Get()) << "each call hands out a new string";
    ASSERT_HR(S_OK, info->GetHelpFile(text.Out()));
    EXPECT_EQ(text.Utf8(), "help.chm");
    DWORD context = 0;
    ASSERT_HR(S_OK, info->GetHelpContext(&context));
    EXPECT_EQ(context, 42u);
    ASSERT_HR(S_OK, info->GetGUID(&guid));
    EXPECT_TRUE(guid == IID_IErrorInfo);

    ASSERT_HR(S_OK, create->SetDescription(nullptr));
    ASSERT_HR(S_OK, info->GetDescription(text.Out()));
    EXPECT_EQ(text.Get(), nullptr);

    EXPECT_HR(E_INVALIDARG, info->GetSource(nullptr));
    EXPECT_HR(E_INVALIDARG, info->GetDescription(nullptr));
    EXPECT_HR(E_INVALIDARG, info->GetHelpFile(nullptr));
    EXPECT_HR(E_INVALIDARG, info->GetHelpContext(nullptr));
    EXPECT_HR(E_INVALIDARG, info->GetGUID(nullptr));
}

TEST(AutomationErrorInfo, ThreadSlotHandsOverItsReference)
{
    ComPtr<IErrorInfo> info = MakeErrorInfo(u"first");
    ASSERT_HR(S_OK, SetErrorInfo(0, info.Get()));
    EXPECT_EQ(RefsOf(info.Get()), 2u);

    ComPtr<IErrorInfo> taken;
    ASSERT_HR(S_OK, GetErrorInfo(0, taken.Out()));
    EXPECT_EQ(taken.Get(), info.Get());
    EXPECT_EQ(RefsOf(info.Get()), 2u) << "the slot's reference went to the caller";

    IErrorInfo *none = info.Get();
    EXPECT_HR(S_FALSE, GetErrorInfo(0, &none));
    EXPECT_EQ(none, nullptr);

    // Setting replaces and releases; setting null clears.
    ComPtr<IErrorInfo> other = MakeErrorInfo(u"second");
    ASSERT_HR(S_OK, SetErrorInfo(0, info.Get()));
    ASSERT_HR(S_OK, SetErrorInfo(0, other.Get()));
    EXPECT_EQ(RefsOf(info.Get()), 2u);
    EXPECT_EQ(RefsOf(other.Get()), 2u);
    ASSERT_HR(S_OK, SetErrorInfo(0, nullptr));
    EXPECT_EQ(RefsOf(other.Get()), 1u);
    EXPECT_HR(S_FALSE, GetErrorInfo(0, &none));

    EXPECT_HR(E_INVALIDARG, SetErrorInfo(1, info.Get()));
    EXPECT_HR(E_INVALIDARG, GetErrorInfo(0, nullptr));
    EXPECT_HR(E_INVALIDARG, GetErrorInfo(1, &none));
}

TEST(AutomationErrorInfo, EachThreadHasItsOwnSlot)
{
    ComPtr<IErrorInfo> info = MakeErrorInfo(u"main thread");
    ASSERT_HR(S_OK, SetErrorInfo(0, info.Get()));
    HRESULT seenByOther = E_FAIL;
    std::thread([&] {
        IErrorInfo *found = nullptr;
        seenByOther = GetErrorInfo(0, &found);
        ComPtr<IErrorInfo> own = MakeErrorInfo(u"other thread");
        SetErrorInfo(0, own.Get());  // left behind: dropped when the thread ends
    }).join();
    EXPECT_HR(S_FALSE, seenByOther);

    ComPtr<IErrorInfo> taken;
    ASSERT_HR(S_OK, GetErrorInfo(0, taken.Out()));
    Bstr text;
    ASSERT_HR(S_OK, taken->GetDescription(text.Out()));
    EXPECT_EQ(text.Utf8(), "main thread");
}

}  // namespace
