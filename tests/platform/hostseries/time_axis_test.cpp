// SPDX-License-Identifier: MIT
// The time axis: step count, times in and out, and what it refuses.
#include <gtest/gtest.h>

#include <vector>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"

namespace {

using automation::ComPtr;

// A one-dimensional array variant of doubles with the given element type and lower bound.
VARIANT DoubleArray(VARTYPE elementType, const std::vector<double> &values, LONG lower = 0)
{
    SAFEARRAY *psa = SafeArrayCreateVector(elementType, lower, static_cast<ULONG>(values.size()));
    void *data = nullptr;
    SafeArrayAccessData(psa, &data);
    for (std::size_t i = 0; i < values.size(); ++i) static_cast<double *>(data)[i] = values[i];
    SafeArrayUnaccessData(psa);
    VARIANT v;
    VariantInit(&v);
    v.vt = VT_ARRAY | elementType;
    v.parray = psa;
    return v;
}

ComPtr<IHostTimeAxis> AxisOf(IHostSeries &series)
{
    ComPtr<IHostTimeAxis> axis;
    EXPECT_HR(S_OK, series.GetTimeAxis(axis.Out()));
    return axis;
}

LONG StepCount(IHostTimeAxis &axis)
{
    LONG count = -1;
    EXPECT_HR(S_OK, axis.GetStepCount(&count));
    return count;
}

TEST(HostTimeAxis, TimesRoundTripAsDates)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostTimeAxis> axis = AxisOf(*series.Get());
    EXPECT_EQ(StepCount(*axis.Get()), 0);

    // 1 January 2024 00:00, 06:00 and 2 January 12:30.
    const std::vector<double> times = {45292.0, 45292.25, 45293.520833333336};
    ASSERT_HR(S_OK, axis->SetAxisKind(HOST_AXIS_KIND_EXPLICIT_TIMES));
    ASSERT_HR(S_OK, axis->SetStepCount(3));
    EXPECT_EQ(StepCount(*axis.Get()), 3);
    ASSERT_HR(S_OK, axis->SetTimes(DoubleArray(VT_DATE, times)));
    EXPECT_EQ(StepCount(*axis.Get()), 3);
    for (LONG step = 1; step <= 3; ++step) {
        automation::Variant time;
        ASSERT_HR(S_OK, axis->GetTime(step, time.Out()));
        EXPECT_EQ(time.Type(), VT_DATE);
        EXPECT_EQ(time.Raw().date, times[static_cast<std::size_t>(step) - 1]) << step;
    }

    for (LONG outside : {0, -1, 4}) {
        automation::Variant time = automation::Variant::R8(1.0);
        EXPECT_HR(E_INVALIDARG, axis->GetTime(outside, time.Out())) << outside;
        EXPECT_EQ(time.Type(), VT_EMPTY);
    }

    EXPECT_EQ(hostseries::ReadTimes(*series.Get()), times);
}

TEST(HostTimeAxis, TheArrayDecidesTheStepCount)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostTimeAxis> axis = AxisOf(*series.Get());

    ASSERT_HR(S_OK, axis->SetStepCount(2));
    // Doubles are taken as dates; an array from 1 starts at step 1 all the same.
    ASSERT_HR(S_OK, axis->SetTimes(DoubleArray(VT_R8, {10.0, 11.0, 12.0, 13.0}, 1)));
    EXPECT_EQ(StepCount(*axis.Get()), 4);
    EXPECT_EQ(hostseries::ReadTimes(*series.Get()), (std::vector<double>{10.0, 11.0, 12.0, 13.0}));

    // A shorter step count drops the last times; a longer one adds steps at time 0.
    ASSERT_HR(S_OK, axis->SetStepCount(2));
    ASSERT_HR(S_OK, axis->SetStepCount(3));
    EXPECT_EQ(hostseries::ReadTimes(*series.Get()), (std::vector<double>{10.0, 11.0, 0.0}));
    EXPECT_HR(E_INVALIDARG, axis->SetStepCount(-1));
    EXPECT_EQ(StepCount(*axis.Get()), 3);

    // An empty array empties the axis.
    ASSERT_HR(S_OK, axis->SetTimes(DoubleArray(VT_DATE, {})));
    EXPECT_EQ(StepCount(*axis.Get()), 0);
}

TEST(HostTimeAxis, RefusesWhatIsNoOneDimensionalDateArray)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostTimeAxis> axis = AxisOf(*series.Get());
    ASSERT_HR(S_OK, axis->SetTimes(DoubleArray(VT_DATE, {1.0, 2.0})));

    // Each refused variant is still taken over and freed (the leak check shows it).
    EXPECT_HR(DISP_E_TYPEMISMATCH, axis->SetTimes(automation::Variant::Date(3.0).Detach()));
    EXPECT_HR(DISP_E_TYPEMISMATCH, axis->SetTimes(automation::Variant::String("1.1.2024").Detach()));
    EXPECT_HR(DISP_E_TYPEMISMATCH, axis->SetTimes(VARIANT{}));

    SAFEARRAY *longs = SafeArrayCreateVector(VT_I4, 0, 2);
    VARIANT longArray;
    VariantInit(&longArray);
    longArray.vt = VT_ARRAY | VT_I4;
    longArray.parray = longs;
    EXPECT_HR(DISP_E_TYPEMISMATCH, axis->SetTimes(longArray));

    SAFEARRAYBOUND bounds[2] = {{2, 0}, {2, 0}};
    VARIANT square;
    VariantInit(&square);
    square.vt = VT_ARRAY | VT_DATE;
    square.parray = SafeArrayCreate(VT_DATE, 2, bounds);
    EXPECT_HR(E_INVALIDARG, axis->SetTimes(square));

    // Nothing of the kept axis changed.
    EXPECT_EQ(hostseries::ReadTimes(*series.Get()), (std::vector<double>{1.0, 2.0}));
}

}  // namespace
