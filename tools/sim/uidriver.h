// Drives real dialogs and pages as a user would, and answers the modal
// dialogs and message boxes they open.
#pragma once
#include <windows.h>

#include <functional>
#include <string>
#include <vector>

struct RecordedMessageBox {
    std::wstring text;
    std::wstring caption;
    UINT type;
    HWND owner;
};

// Message boxes of module mod are recorded and answered without being shown:
// with the next queued answer, else IDYES for yes/no boxes and IDOK otherwise.
void InstallMessageBoxRecorder(HMODULE mod);
std::vector<RecordedMessageBox>& TheMessageBoxes();
void QueueMessageBoxAnswer(int answer);

// A script for the next modal dialog of this thread: it runs inside the
// dialog's own message loop once the dialog is initialised, and is expected
// to end the dialog (press OK or Cancel). Scripts run in queue order, so a
// script that opens a nested dialog is followed by that dialog's script.
using DialogScript = std::function<void(HWND dialog)>;
void QueueDialog(DialogScript script);
// Scripts still waiting (a test ends with none left).
size_t PendingDialogScripts();
void ClearDialogScripts();
// Template-free facts about the last dialog a script ran for.
std::wstring WindowText(HWND hwnd);
std::wstring ItemText(HWND dialog, int id);

// User actions on controls.
void Click(HWND dialog, int id);                        // BM_CLICK: disabled buttons ignore it
void TypeInto(HWND dialog, int id, const std::wstring& text);  // types over the whole text, key by key
// Keys at the end of the text (VK_BACK deletes the last character).
void TypeAtEnd(HWND dialog, int id, const std::wstring& keys);
// Keys at the start of the text.
void TypeAtStart(HWND dialog, int id, const std::wstring& keys);
void SetFieldText(HWND dialog, int id, const std::wstring& text);  // as a paste would
void PressKey(HWND target, UINT vk);
void SelectListItem(HWND dialog, int id, int index);    // list box or combo box, with its notification
void ToggleMultiSelect(HWND dialog, int id, int index); // a click in a multiple-selection list
std::vector<std::wstring> ListItems(HWND dialog, int id);
int ListSelection(HWND dialog, int id);
bool IsEnabled(HWND dialog, int id);
bool IsChecked(HWND dialog, int id);
// Runs the thread's message queue until it is empty.
void PumpMessages();
