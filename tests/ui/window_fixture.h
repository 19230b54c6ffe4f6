// A chat window in a host view, with a recorder in the engine's place, and helpers that
// send it the engine's commands.
#pragma once

#include <gtest/gtest.h>

#include <QApplication>
#include <QElapsedTimer>
#include <QWidget>
#include <memory>
#include <string>

#include "engine/menu_status.h"
#include "tests/ui/event_recorder.h"
#include "ui/chat_menu_item.h"
#include "ui/chat_popup_button.h"
#include "ui/kvo_text_field.h"
#include "ui/my_chat_controller.h"

inline MenuStatus Entry(const std::string& title, std::int32_t groupId = -1, bool enabled = true) {
    MenuStatus entry;
    entry.strTitle = title;
    entry.nGroupID = groupId;
    entry.bEnabled = enabled;
    return entry;
}

inline MenuStatus SeparatorEntry(const std::string& title = "") {
    MenuStatus entry = Entry(title);
    entry.bSeparator = true;
    return entry;
}

// Runs Qt events until done() holds or about six seconds passed; whether it holds.
template <typename Done>
bool RunUntil(Done done) {
    QElapsedTimer clock;
    clock.start();
    while (!done() && clock.elapsed() < 6000)
        QApplication::processEvents(QEventLoop::AllEvents, 5);
    return done();
}

class WindowTest : public testing::Test {
protected:
    WindowTest() {
        host.resize(420, 360);
        window = std::make_unique<MyChatController>();
        window->SetSuperView(&host);
        window->SetSink(&engine);
        host.show();
        QApplication::processEvents();
        engine.events.clear();
    }

    int Command(int id, void* in = nullptr, void* out = nullptr) {
        return window->HandleCommand(id, in, out);
    }
    int Command(int id, std::int32_t value) { return Command(id, &value); }

    void Rebuild(const MenuStatusList& entries) {
        MenuStatusList copy = entries;
        Command(msg_RebuildMenu, &copy);
    }

    // The popup's rows as shown: their text ("-" for a separator).
    std::vector<std::string> Rows() const {
        std::vector<std::string> rows;
        ChatPopUpButton* popup = window->userlist();
        for (int i = 0; i < popup->numberOfItems(); ++i) {
            QStandardItem* item = popup->itemAtIndex(i);
            rows.push_back(ChatMenuItem::IsSeparator(item) ? "-" : item->text().toStdString());
        }
        return rows;
    }

    int Selected() const { return window->userlist()->currentIndex(); }
    bool InputEnabled() const { return window->editView()->isEnabled(); }

    QWidget host;
    EventRecorder engine;
    std::unique_ptr<MyChatController> window;
};
