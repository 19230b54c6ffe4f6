// The attendee picker: a floating tool window listing attendees by name, with a search and
// OK; at most one exists in the process. Its owner is the chat window that opened it.
#pragma once

#include <QDialog>
#include <QPointer>
#include <memory>

#include "ui/attd_data_source.h"

class MyChatController;
class QLineEdit;
class QPushButton;
class QTableView;

class ChatSelectAttdControl final : public QDialog {
    Q_OBJECT

public:
    // The single dialog; *created is 1 when this call made it, else 0.
    static ChatSelectAttdControl* getInstance(int* created);
    // The single dialog, or null.
    static ChatSelectAttdControl* instance();

    void SetSuperController(MyChatController* owner) { mSuperController = owner; }
    void ClearTable();
    void makeFront();
    // Inserts item in the table's current order.
    void addItemToTable(std::unique_ptr<AttendeeItem> item);
    // Asks the warning that is showing to close; false when none shows.
    bool closeWarningDlg();
    bool isShowingWarning() const { return m_bShowingWarningDlg; }

    // Selects the next row whose name contains the search text (ignoring case), wrapping
    // around to the selected row; warns when the text is blank or nothing matches.
    void onFind();
    // Clears the list and asks the engine again.
    void onRefresh();
    // Sends the selected row's id to the owner, then closes.
    void onOK();
    void onCancel() { Close(); }
    // Detaches the owner (which learns the dialog is gone) and destroys the dialog once no
    // nested event loop of it runs any more.
    void Close();

    AttdDataSource* dataSource() const { return mTableDS; }
    QTableView* tableView() const { return mTableView; }
    QLineEdit* findTextField() const { return mFindTextField; }
    QPushButton* okButton() const { return mOKButton; }

protected:
    void closeEvent(QCloseEvent* event) override;
    void reject() override { Close(); }

private:
    ChatSelectAttdControl();
    ~ChatSelectAttdControl() override;

    void tableViewSelectionDidChange();
    int SelectedRow() const;
    // Shows one of the picker's warnings and returns once it is gone.
    void ShowWarning(const char* key);

    QTableView* mTableView;
    AttdDataSource* mTableDS;
    QLineEdit* mFindTextField;
    QPushButton* mOKButton;
    QPointer<MyChatController> mSuperController;
    bool m_bShowingWarningDlg = false;
    int m_nNestedLoops = 0;  // warnings running inside this dialog's code
    bool m_bClosing = false;
};
