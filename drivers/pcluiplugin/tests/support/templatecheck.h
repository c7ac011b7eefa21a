// Checks of the plug-in's dialog templates through real windows: a template
// is created as a hidden dialog and its controls are compared with a table
// of ids, classes, styles and texts, and its layout with what the user sees.
#pragma once
#include <windows.h>
#include <commctrl.h>

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace templatecheck {

// Style bits a control must have (on) and must not have (off).
struct Bits {
    DWORD on = 0, off = 0;
};
constexpr Bits operator|(Bits a, Bits b) { return {a.on | b.on, a.off | b.off}; }
constexpr Bits On(DWORD s) { return {s, 0}; }
constexpr Bits Off(DWORD s) { return {0, s}; }
// An enumerated style field (button type, static type, combo type): exactly
// value within mask.
constexpr Bits Kind(DWORD mask, DWORD value) { return {value, mask & ~value}; }

inline constexpr Bits kPush = Kind(BS_TYPEMASK, BS_PUSHBUTTON) | On(WS_TABSTOP);
inline constexpr Bits kDefault = Kind(BS_TYPEMASK, BS_DEFPUSHBUTTON) | On(WS_TABSTOP);
inline constexpr Bits kGroupBox = Kind(BS_TYPEMASK, BS_GROUPBOX);
inline constexpr Bits kFirstRadio = Kind(BS_TYPEMASK, BS_AUTORADIOBUTTON) | On(WS_GROUP | WS_TABSTOP);
inline constexpr Bits kRadio = Kind(BS_TYPEMASK, BS_AUTORADIOBUTTON) | Off(WS_GROUP);
inline constexpr Bits kCheck = Kind(BS_TYPEMASK, BS_AUTOCHECKBOX) | On(WS_TABSTOP);
inline constexpr Bits kLabel = Kind(SS_TYPEMASK, SS_LEFT) | Off(WS_TABSTOP);
// Created hidden; the page shows it when it applies.
inline constexpr Bits kHidden = Off(WS_VISIBLE);

inline constexpr WCHAR kButton[] = L"Button";
inline constexpr WCHAR kStatic[] = L"Static";
inline constexpr WCHAR kEditClass[] = L"Edit";
inline constexpr WCHAR kListBox[] = L"ListBox";
inline constexpr WCHAR kComboBox[] = L"ComboBox";
inline constexpr WCHAR kUpDown[] = L"msctls_updown32";
inline constexpr WCHAR kTrackbarClass[] = L"msctls_trackbar32";
inline constexpr WCHAR kListView[] = L"SysListView32";

constexpr int kUnnumbered = -1;

// One control of a template. Every control is a visible, enabled child
// unless its style says WS_DISABLED on or WS_VISIBLE off.
struct Control {
    int id;              // kUnnumbered: found by its text among the unnumbered controls
    const WCHAR* cls;
    Bits style;
    const WCHAR* text;   // nullptr: the text is not set by the template
};

// A control identified by id, or by text when it has none.
struct Ref {
    int id;
    const WCHAR* text = nullptr;
};

// A group box and the controls it frames.
struct Frame {
    Ref group;
    std::vector<int> members;
};

// A field and the text of the label that leads to it.
struct Labelled {
    int field;
    const WCHAR* label;
};

// A control of a DIALOGEX template as the resource compiler wrote it.
struct Item {
    int id;
    DWORD style;
};

// The controls of the template in creation order; empty when it is missing
// or not a DIALOGEX.
std::vector<Item> TemplateItems(UINT id);

// A template of the plug-in's module created as a hidden dialog with an inert
// procedure; page templates (WS_CHILD) and modal ones alike get a hidden
// top-level window as parent or owner.
class Dialog {
public:
    explicit Dialog(UINT id);
    ~Dialog();
    Dialog(const Dialog&) = delete;
    Dialog& operator=(const Dialog&) = delete;
    HWND get() const { return hwnd_; }

private:
    HWND parent_ = nullptr;
    HWND hwnd_ = nullptr;
};

// The dialog's font selected into its DC for measuring; get() is null unless
// both the DC and the font are there.
class FontDC {
public:
    explicit FontDC(HWND dlg);
    ~FontDC();
    FontDC(const FontDC&) = delete;
    FontDC& operator=(const FontDC&) = delete;
    HDC get() const { return old_ ? dc_ : nullptr; }

private:
    HWND hwnd_;
    HDC dc_;
    HGDIOBJ old_ = nullptr;
};

std::wstring Text(HWND hwnd);
std::wstring ClassOf(HWND hwnd);
DWORD StyleOf(HWND hwnd);
int IdOf(HWND hwnd);
std::vector<HWND> Children(HWND dlg);
// nullptr when missing or, for an unnumbered control, ambiguous.
HWND Find(HWND dlg, const Ref& ref);
// The control's rectangle in the dialog's client coordinates.
RECT RectOf(HWND dlg, HWND hwnd);
bool Contains(const RECT& outer, const RECT& inner);
std::string Describe(HWND hwnd);
bool IsGroupBox(HWND hwnd);
// An up-down control and the field it is attached to.
bool IsBuddyPair(HWND a, HWND b);
// The text as drawn: "&x" shows x underlined, "&&" shows one ampersand.
std::wstring Shown(const std::wstring& text);
// Width and height of text as a control draws it, on one line or broken into
// lines of at most width pixels.
SIZE Measure(HDC dc, const std::wstring& text, int width = 0, bool wrap = false);
// A string of the plug-in's module; empty when missing.
std::wstring LoadText(UINT id);

// How a static's text may be laid out: on one line, or wrapped when the
// control is tall enough for two lines.
enum class Lines { One, AsRoomAllows };

// Fails unless text fits the control's client area. Push buttons keep room
// for their frame, check boxes and radios for the box, group boxes for the
// frame line on both sides of the caption.
void ExpectTextFits(HWND hwnd, HDC dc, const std::wstring& text, Lines lines = Lines::AsRoomAllows);
// ExpectTextFits for every control showing its own text (combo boxes show
// their selection); returns how many were measured.
int ExpectTextsFit(HWND dlg, HDC dc, Lines lines = Lines::AsRoomAllows);

// Runs check(t, dialog) for every entry t of templates (anything with a
// template id), each created afresh; a template that cannot be created fails
// and is skipped.
template <class Templates, class Check>
void ForEachTemplate(const Templates& templates, Check check)
{
    for (const auto& t : templates) {
        SCOPED_TRACE("template " + std::to_string(t.id));
        Dialog dlg(t.id);
        EXPECT_NE(dlg.get(), nullptr);
        if (dlg.get())
            check(t, dlg.get());
    }
}

// Whether the template must create its controls in the order listed.
enum class Order { Listed, Any };

// Every control of the dialog is listed, with its id, class and text, and the
// style bits it must and must not have both in the template and live.
void ExpectControls(HWND dlg, UINT templateId, const std::vector<Control>& controls, Order order);
// A modal dialog has exactly its default button; a page (defaultButton 0)
// leaves the default button to its sheet.
void ExpectDefaultButton(HWND dlg, int defaultButton);
// The label comes right before its field in the tab order and above or left
// of it, so that its accelerator moves the focus on to the field.
void ExpectLabelLeads(HWND dlg, const Labelled& l);
// The group box frames every member.
void ExpectFrame(HWND dlg, const Frame& f);
// Every control lies inside the dialog with a size; visible controls do not
// overlap unless a group box frames the other or an up-down sits on its buddy.
void ExpectInsideAndApart(HWND dlg);

}  // namespace templatecheck
