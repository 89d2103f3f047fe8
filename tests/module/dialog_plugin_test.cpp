// SPDX-License-Identifier: MIT
// The dialogs live in a plug-in beside the module: the module alone needs no
// Qt or X library, and without the plug-in the two dialogs fail with the file.
#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "automation/com_ptr.h"
#include "module/loaded_module.h"
#include "support/expect_hr.h"
#include "support/program_run.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace {

using automation::ComPtr;

bool LinksQtOrX(const std::string &libraries)
{
    for (const char *name : {"libQt6", "libX11", "libxcb", "libGL", "libEGL", "libxkbcommon"})
        if (libraries.find(name) != std::string::npos) return true;
    return false;
}

TEST(DialogPlugin, OnlyThePluginLoadsQtAndX)
{
    const std::string folder = std::filesystem::path(VANTREL_MODULE_PATH).parent_path().string();
    const struct {
        std::string file;
        bool qt;
    } cases[] = {{VANTREL_MODULE_PATH, false}, {folder + "/GenericExcelVantrelDialogs.so", true}};
    for (const auto &c : cases) {
        const auto libraries = testing_host::RunProgram("/usr/bin/ldd", {c.file});
        ASSERT_EQ(libraries.status, 0) << c.file << ": " << libraries.err;
        EXPECT_EQ(LinksQtOrX(libraries.out), c.qt) << c.file << ":\n" << libraries.out;
    }
}

TEST(DialogPlugin, DialogsWithoutThePluginFailNamingIt)
{
    // The built module stays loaded, so that the copy finds the platform libraries.
    testing_host::LoadedModule built;
    testing_host::TempDir folder;
    const std::string copy = folder.File("GenericExcelVantrel.so");
    std::filesystem::copy_file(VANTREL_MODULE_PATH, copy);
    testing_host::LoadedModule module(copy.c_str());
    ComPtr<IClassFactory> factory;
    ASSERT_HR(S_OK, module.getClassObject(testing_host::kClsidExcelVantrel, IID_IClassFactory, factory.OutVoid()));
    ComPtr<IVantrel> bridge;
    ASSERT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    auto series = testing_host::MakeSeries(folder.File("book.xlsx"), "", true);
    ASSERT_HR(S_OK, bridge->SetHostSeries(series.Get()));

    const std::string expected = "The dialogs could not be loaded: " + folder.File("GenericExcelVantrelDialogs.so") +
                                 ": cannot open shared object file: No such file or directory";
    EXPECT_HR(E_FAIL, bridge->OpenDialog());
    EXPECT_EQ(testing_host::TakeErrorDescription(), expected);
    EXPECT_HR(E_FAIL, bridge->SaveDialog());
    EXPECT_EQ(testing_host::TakeErrorDescription(), expected);
}

}  // namespace
