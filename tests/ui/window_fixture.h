// A chat window in a host view, with a recorder in the engine's place, and helpers that
// send it the engine's commands.
#pragma once

#include <gtest/gtest.h>

#include <QApplication>
#include <QWidget>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "api/window_bridge.h"
#include "engine/menu_status.h"
#include "ui/chat_menu_item.h"
#include "ui/chat_popup_button.h"
#include "ui/kvo_text_field.h"
#include "ui/my_chat_controller.h"

// An event the window raised with its value: 5001/5002 the int, 5003 the node id, 5000 0.
using RecordedEvent = std::pair<int, std::int64_t>;

// The engine's side of the window: records every event, and may answer one by calling back
// into the window.
class EventRecorder final : public IChatCommSinkForChatUI {
public:
    int HandleUIMessage(int message, void* iParam, void*) override {
        std::int64_t value = 0;
        if (iParam && message == msg_AttendeeSelected) {
            value = *static_cast<std::uint32_t*>(iParam);
        } else if (iParam) {
            value = *static_cast<std::int32_t*>(iParam);
        }
        events.emplace_back(message, value);
        if (onEvent) onEvent(message);
        return 0;
    }

    std::vector<RecordedEvent> events;
    std::function<void(int id)> onEvent;
};

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

    // Inserts an entry at a position, or without one (-1).
    void Insert(MenuStatus entry, std::int32_t at = -1) {
        Command(msg_InsertMenuItem, &entry, at < 0 ? nullptr : &at);
    }

    void Rebuild(MenuStatusList entries) { Command(msg_RebuildMenu, &entries); }

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
