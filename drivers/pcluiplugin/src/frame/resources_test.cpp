// The module's resources as the pages and the driver load them.
#include "frame/module.h"
#include "resources/resource.h"

#include <gtest/gtest.h>
#include <string>

namespace {

std::wstring Str(UINT id)
{
    WCHAR buf[1024] = {};
    int n = LoadStringW(ModuleInstance(), id, buf, 1024);
    return n > 0 ? std::wstring(buf, n) : std::wstring(L"<missing>");
}

#pragma pack(push, 1)
struct DlgTemplateExHead {
    WORD dlgVer, signature;
    DWORD helpID, exStyle, style;
    WORD cDlgItems;
    short x, y, cx, cy;
};
#pragma pack(pop)

// Caption and size of a DIALOGEX template.
bool ReadTemplate(UINT id, std::wstring& caption, int& cx, int& cy)
{
    HRSRC r = FindResourceExW(ModuleInstance(), RT_DIALOG, MAKEINTRESOURCEW(id),
                              MAKELANGID(LANG_ENGLISH, SUBLANG_ENGLISH_US));
    if (!r)
        return false;
    auto* head = static_cast<const DlgTemplateExHead*>(LockResource(LoadResource(ModuleInstance(), r)));
    if (!head || head->signature != 0xFFFF)
        return false;
    cx = head->cx;
    cy = head->cy;
    auto* p = reinterpret_cast<const WORD*>(head + 1);
    for (int field = 0; field < 2; ++field) {  // menu, class
        if (*p == 0xFFFF)
            p += 2;
        else
            while (*p++) {
            }
    }
    caption = reinterpret_cast<const WCHAR*>(p);
    return true;
}

}  // namespace

TEST(Resources, StringTableTextsExactly)
{
    EXPECT_EQ(Str(3), L"Norvane PCL Plug-in UI DLL");
    EXPECT_EQ(Str(12), L"Ошибка");
    EXPECT_EQ(Str(17), L"Ошибка записи данных в реестр.  Убедитесь в наличии прав для записи в реестр и повторите запись.");
    EXPECT_EQ(Str(146), L"ЧЕРНОВАЯ ПЕЧАТЬ");
    EXPECT_EQ(Str(157), L"(Нет)");
    EXPECT_EQ(Str(166), L"В режиме растровой графики водяные знаки могут отображаться неправильно.  Отключите либо режим "
                        L"растровой графики (в диалоговом окне \"\"Дополнительно\"\"), либо водяные знаки.");
    EXPECT_EQ(Str(175).find(L"профиле \"%s\"?"), Str(175).size() - 13);
    const std::wstring head182 = L"The filename you entered could not be opened. Please make sure that: \n\n- You";
    EXPECT_EQ(Str(182).substr(0, head182.size()), head182);
    EXPECT_EQ(Str(185).back(), L' ') << "the trailing space is part of the text";
    EXPECT_EQ(Str(198), L"%%");
    EXPECT_EQ(Str(232), L"Arial");
    for (UINT missing : {1u, 5u, 26u, 100u, 220u, 233u})
        EXPECT_EQ(Str(missing), L"<missing>") << missing;
}

TEST(Resources, DialogTemplatesManifestIconAndVersion)
{
    struct { UINT id; const WCHAR* caption; int cx, cy; } templates[] = {
        {101, L"Настроить динамические водяные знаки", 397, 209}, {103, L"Add/Edit Watermark", 322, 322},
        {104, L"Водяной знак", 360, 273}, {107, L"Ручная цветокоррекция", 360, 273},
        {108, L"О программе", 249, 161}, {109, L"О программе", 282, 250}, {112, L"Build Tool Stinks", 282, 250},
        {113, L"Сохранить персональный профиль", 230, 153}, {114, L"Personal Profiles - Export", 316, 140},
        {135, L"Выберите водяные знаки, которые требуется удалить", 332, 159},
        {136, L"Выберите водяной знак, который требуется редактировать", 302, 178},
        {137, L"О программе", 360, 273}, {138, L"Параметры выдачи", 360, 273},
        {220, L"Разместить водяной знак", 352, 215}, {221, L"Профили", 360, 273},
        {222, L"Переименовать персональный профиль", 230, 153}, {224, L"Personal Profiles - Export", 316, 140},
        {225, L"Personal Profiles - Import", 316, 140}, {226, L"Personal Profiles - Import", 316, 140},
        {229, L"Качество черно-белой печати", 360, 273}, {231, L"Качество печати RGB", 284, 257},
        {233, L"О программе", 282, 250}, {234, L"О программе", 360, 273},
    };
    for (auto& t : templates) {
        std::wstring caption;
        int cx = 0, cy = 0;
        ASSERT_TRUE(ReadTemplate(t.id, caption, cx, cy)) << t.id;
        EXPECT_EQ(caption, t.caption) << t.id;
        EXPECT_EQ(cx, t.cx) << t.id;
        EXPECT_EQ(cy, t.cy) << t.id;
    }
    HRSRC manifest = FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(2), MAKEINTRESOURCEW(24));
    ASSERT_NE(manifest, nullptr);
    std::string text(static_cast<const char*>(LockResource(LoadResource(ModuleInstance(), manifest))),
                     SizeofResource(ModuleInstance(), manifest));
    EXPECT_NE(text.find("Microsoft.Windows.Common-Controls"), std::string::npos);
    EXPECT_NE(text.find("6595b64144ccf1df"), std::string::npos);
    EXPECT_NE(FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(116), RT_GROUP_ICON), nullptr);
    EXPECT_NE(FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(1), RT_ICON), nullptr);
    HRSRC ver = FindResourceW(ModuleInstance(), MAKEINTRESOURCEW(1), RT_VERSION);
    ASSERT_NE(ver, nullptr);
    auto* data = static_cast<const BYTE*>(LockResource(LoadResource(ModuleInstance(), ver)));
    const VS_FIXEDFILEINFO* ffi = nullptr;
    for (DWORD i = 0; i + sizeof(VS_FIXEDFILEINFO) <= SizeofResource(ModuleInstance(), ver); i += 4) {
        auto* f = reinterpret_cast<const VS_FIXEDFILEINFO*>(data + i);
        if (f->dwSignature == 0xFEEF04BD) {
            ffi = f;
            break;
        }
    }
    ASSERT_NE(ffi, nullptr);
    EXPECT_EQ(ffi->dwFileVersionMS, 0x00010000u);
    EXPECT_EQ(ffi->dwFileVersionLS, 0u);
    EXPECT_EQ(ffi->dwProductVersionMS, 0x00010000u);
}
