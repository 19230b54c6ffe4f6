// The host client's small panel over the chat components it runs: roles, host and presenter,
// privileges, practice, QM and recording, each applied through the component's exported
// functions; join and leave buttons when the program offers them.
#pragma once

#include <QWidget>
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "api/quintarachat.h"

class QCheckBox;
class QComboBox;
class QSpinBox;

class HostPanel final : public QWidget {
    Q_OBJECT
public:
    // One component the panel acts on.
    struct Member {
        std::string name;  // shown in the participant list
        ChatHandle handle = nullptr;
        std::uint32_t nodeId = 0;
    };
    // What the program lends the panel. members is read whenever the panel acts; act runs one
    // call on a member's behalf (by default it simply runs it); join and leave, when set, show
    // their buttons.
    struct Hooks {
        std::function<std::vector<Member>()> members;
        std::function<void(const Member&, const std::function<void()>&)> act;
        std::function<void()> join;
        std::function<void(const Member&)> leave;
    };

    // The privilege bits the panel offers, with the word a component starts with.
    static constexpr std::uint32_t kStartPrivilege = 0x10047;
    static constexpr std::uint32_t kQMFeature = 0x200000;

    explicit HostPanel(Hooks hooks, QWidget* parent = nullptr);

    // The feature word the QM box adds its bit to or takes it from.
    void SetFeatureWord(std::uint32_t features);
    // Re-reads the members into the participant list, keeping the chosen one when it is there.
    void Refresh();

    // The controls, for tests and for programs that preset them.
    QComboBox* participantList() const { return m_members; }
    QSpinBox* nodeField() const { return m_node; }
    QCheckBox* roleBox(std::uint32_t role) const;
    QCheckBox* privilegeBox(std::uint32_t bit) const;
    QCheckBox* practiceBox() const { return m_practice; }
    QCheckBox* qmBox() const { return m_qm; }
    QCheckBox* recordingBox() const { return m_recording; }

public slots:
    void applyRoles();
    void makeHost();
    void makePresenter();
    void applyPrivilege();
    void applyPractice();
    void applyQM();
    void applyRecording();
    void leaveChosen();

private:
    struct Bit {
        std::uint32_t value;
        QCheckBox* box;
    };

    // The member chosen in the participant list; false when there is none.
    bool Chosen(Member* out) const;
    // Runs fn for every member, each on its own behalf.
    void ForEachMember(const std::function<void(const Member&)>& fn) const;
    void Act(const Member& member, const std::function<void()>& fn) const;
    static std::uint32_t Word(const std::vector<Bit>& bits);
    void ChosenChanged();

    Hooks m_hooks;
    std::vector<Member> m_listed;  // what the participant list shows, in its order
    std::uint32_t m_features = 0;

    QComboBox* m_members = nullptr;
    QSpinBox* m_node = nullptr;  // the node that Host and Presenter name
    std::vector<Bit> m_roles;
    std::vector<Bit> m_privileges;
    QCheckBox* m_practice = nullptr;
    QCheckBox* m_qm = nullptr;
    QCheckBox* m_recording = nullptr;
};
