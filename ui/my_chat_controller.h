// The chat window: a transcript above a send-to row and the input. It carries out the
// engine's numbered commands and reports the user's actions to the engine's sink.
#pragma once

#include <QLabel>
#include <QObject>
#include <QPointer>
#include <memory>

#include "api/window_bridge.h"
#include "engine/menu_status.h"
#include "ui/chat_view.h"

class ChatPopUpButton;
class ChatSelectAttdControl;
class KvoTextField;
class NSTextViewWithLinks;
class QFrame;
class QPushButton;
class QStandardItem;
class WhiteView;

class MyChatController final : public QObject, public IChatWindow {
    Q_OBJECT

public:
    MyChatController();
    ~MyChatController() override;

    // IChatWindow: the host view (a QWidget*), the engine's sink, the commands.
    void SetSuperView(void* view) override { setSupperView(static_cast<QWidget*>(view)); }
    void SetSink(IChatCommSinkForChatUI* pSink) override { setSink(pSink); }
    // Always 0; unknown commands are ignored.
    int HandleCommand(int command, void* inParam, void* outParam) override;

    void setSupperView(QWidget* view);
    void setSink(IChatCommSinkForChatUI* pSink);

    // User actions.
    void onSend();
    void actionSelectUserList();
    // Opens the attendee picker (sender non-null), or learns that it went away (null).
    void popAttendeeList(QObject* sender);
    void onSelectedAttendee(std::uint32_t id);
    void scrollToTop();
    void scrollToBottom();
    bool isScrollAtBottom() const;

    // Appends a title line or a message body (split into text and link runs).
    void onRecevie(const QString& message, bool isTitle);
    // Reports the selection to the engine (event 5001) and refreshes the tooltip.
    void sendoutSelection();
    void resetTooltip();
    void setChatInputEditable(bool editable);
    bool isNoSendToMode() const { return mbNoSendToMode; }
    static QString GetLocalizedString(const QString& key);

    // The widgets, for the host and for tests.
    ChatView* containerView() const { return m_containerView; }
    NSTextViewWithLinks* textView() const { return m_textView; }
    KvoTextField* editView() const { return m_editView; }
    ChatPopUpButton* userlist() const { return m_userlist; }
    QLabel* sendToLabel() const { return m_sendToLabel; }
    ChatSelectAttdControl* attendeeDialog() const;
    int selectedIndex() const { return m_selectedIndex; }
    bool selectedUserLeft() const { return mbSelectedUserLeave; }
    bool menuPopup() const { return mbMenuPopup; }

private:
    void BuildLayout();  // the layout "chatui"
    // The user chose the item at index: runs the item's action.
    void OnItemChosen(int index);
    int RunCommand(int command, void* inParam, void* outParam, bool placeholderTakenOut);

    // Placeholder item "--- Please Select ---".
    QString PlaceholderTitle() const;
    int PlaceholderIndex() const;
    void AppendPlaceholder();
    void RemoveRow(int index);
    // Closes an open popup list the way Escape would, without its end-of-tracking handling.
    void ClosePopupFromCode();
    void UserlistMenuPopup();
    void UserlistMenuEndTracking();

    // Commands.
    void InsertMenuItem(const MenuStatus* entry, const std::int32_t* position);
    void RemoveMenuItem(int index);
    void SelectedUserLeft(int index, bool placeholderTakenOut);
    void RenameMenuItem(const std::string* title, int index);
    void SelectMenuItem(int index);
    void SelectMenuItemAndAllowInput(int index, bool placeholderTakenOut);
    void UpdateMenuItem(const MenuStatus* entry, int index);
    void RebuildMenu(const MenuStatusList* entries);
    void PanelStatusChanged();
    void GetInputText(std::string* text) const;
    void RunSavePanel(std::int32_t* confirmed, std::string* path);
    void RunOpenPanel(std::int32_t* confirmed, std::string* path);
    static void WriteTextFile(const char* path, const char* content);
    static void ReadTextFile(const char* path, std::string* content);
    void AddAttendee(const AttendeeRecord* record);
    void CloseAttendeeWarning(std::int32_t* showing);
    void FocusInput();
    void handleNoSendToItems();
    void relayoutMsgContentView();
    void hideSendToItems();
    void updateSendToArea();
    void onReceiveMsg(const QString& text, bool isTitle, bool isUrl);
    void createLink(int start, int length, const QString& link);
    float PopupWidth() const;
    void SendEvent(int message, void* iParam);

    // Widgets; the container owns the rest and lives in the host view.
    QPointer<ChatView> m_containerView;
    NSTextViewWithLinks* m_textView = nullptr;
    KvoTextField* m_editView = nullptr;
    QWidget* m_superView = nullptr;
    ChatPopUpButton* m_userlist = nullptr;
    WhiteView* m_whiteView = nullptr;
    QWidget* m_contentView = nullptr;
    QFrame* m_sendToLine = nullptr;
    QLabel* m_sendToLabel = nullptr;
    QPushButton* m_sendButton = nullptr;

    IChatCommSinkForChatUI* m_pSink = nullptr;
    int m_selectedIndex = 0;
    bool mbMenuPopup = false;
    QPointer<ChatSelectAttdControl> mSelectAttControl;
    bool mbSelectedUserLeave = false;
    bool mbNoSendToMode = false;

    // Panels run nested event loops inside a command; the destructor may run meanwhile.
    int m_nNestedLoops = 0;
    std::shared_ptr<bool> m_alive = std::make_shared<bool>(true);
};
