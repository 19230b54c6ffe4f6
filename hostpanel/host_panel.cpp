#include "hostpanel/host_panel.h"

#include <QCheckBox>
#include <QComboBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QSpinBox>
#include <QVBoxLayout>

namespace {

// The recording status a host reports while the session is recorded, and when it is not.
constexpr std::uint32_t kRecording = 3;
constexpr std::uint32_t kNotRecording = 1;

QCheckBox* AddBox(QGridLayout* grid, const QString& text, int index, int columns) {
    auto* box = new QCheckBox(text);
    grid->addWidget(box, index / columns, index % columns);
    return box;
}

}  // namespace

HostPanel::HostPanel(Hooks hooks, QWidget* parent) : QWidget(parent), m_hooks(std::move(hooks)) {
    setWindowTitle(tr("Host panel"));
    auto* layout = new QVBoxLayout(this);

    auto* who = new QHBoxLayout;
    m_members = new QComboBox;
    m_node = new QSpinBox;
    m_node->setRange(0, 0x7fffffff);
    who->addWidget(new QLabel(tr("Participant")));
    who->addWidget(m_members, 1);
    who->addWidget(new QLabel(tr("node")));
    who->addWidget(m_node);
    layout->addLayout(who);

    auto* roles = new QGroupBox(tr("Roles"));
    auto* roleGrid = new QGridLayout(roles);
    const std::pair<std::uint32_t, QString> kRoles[] = {
        {0x1, tr("Host")}, {0x2, tr("Presenter")}, {0x4, tr("Panelist")}};
    for (const auto& [value, text] : kRoles)
        m_roles.push_back({value, AddBox(roleGrid, text, static_cast<int>(m_roles.size()), 3)});
    auto* setRoles = new QPushButton(tr("Set roles"));
    auto* host = new QPushButton(tr("Make host"));
    auto* presenter = new QPushButton(tr("Make presenter"));
    roleGrid->addWidget(setRoles, 1, 0);
    roleGrid->addWidget(host, 1, 1);
    roleGrid->addWidget(presenter, 1, 2);
    layout->addWidget(roles);

    auto* privileges = new QGroupBox(tr("Chat privileges"));
    auto* privilegeGrid = new QGridLayout(privileges);
    const std::pair<std::uint32_t, QString> kPrivileges[] = {
        {0x1, tr("Attendees")},    {0x2, tr("Host")},       {0x4, tr("Presenter")},
        {0x8, tr("Private chat")}, {0x40, tr("Panelists")}, {0x10000, tr("Everyone (QM)")}};
    for (const auto& [value, text] : kPrivileges) {
        QCheckBox* box = AddBox(privilegeGrid, text, static_cast<int>(m_privileges.size()), 3);
        box->setChecked((kStartPrivilege & value) != 0);
        m_privileges.push_back({value, box});
        connect(box, &QCheckBox::toggled, this, &HostPanel::applyPrivilege);
    }
    layout->addWidget(privileges);

    auto* session = new QHBoxLayout;
    m_practice = new QCheckBox(tr("Practice session"));
    m_qm = new QCheckBox(tr("QM"));
    m_recording = new QCheckBox(tr("Recording"));
    session->addWidget(m_practice);
    session->addWidget(m_qm);
    session->addWidget(m_recording);
    layout->addLayout(session);

    if (m_hooks.join || m_hooks.leave) {
        auto* people = new QHBoxLayout;
        if (m_hooks.join) {
            auto* join = new QPushButton(tr("Join"));
            people->addWidget(join);
            connect(join, &QPushButton::clicked, this, [this] {
                m_hooks.join();
                Refresh();
            });
        }
        if (m_hooks.leave) {
            auto* leave = new QPushButton(tr("Leave"));
            people->addWidget(leave);
            connect(leave, &QPushButton::clicked, this, &HostPanel::leaveChosen);
        }
        layout->addLayout(people);
    }

    connect(m_members, &QComboBox::currentIndexChanged, this, &HostPanel::ChosenChanged);
    connect(setRoles, &QPushButton::clicked, this, &HostPanel::applyRoles);
    connect(host, &QPushButton::clicked, this, &HostPanel::makeHost);
    connect(presenter, &QPushButton::clicked, this, &HostPanel::makePresenter);
    connect(m_practice, &QCheckBox::toggled, this, &HostPanel::applyPractice);
    connect(m_qm, &QCheckBox::toggled, this, &HostPanel::applyQM);
    connect(m_recording, &QCheckBox::toggled, this, &HostPanel::applyRecording);
    Refresh();
}

void HostPanel::SetFeatureWord(std::uint32_t features) {
    m_features = features & ~kQMFeature;
    const QSignalBlocker quiet(m_qm);
    m_qm->setChecked((features & kQMFeature) != 0);
}

void HostPanel::Refresh() {
    const ChatHandle chosen =
        m_members->currentIndex() >= 0 && m_members->currentIndex() < int(m_listed.size())
            ? m_listed[m_members->currentIndex()].handle
            : nullptr;
    m_listed = m_hooks.members ? m_hooks.members() : std::vector<Member>{};
    const QSignalBlocker quiet(m_members);
    m_members->clear();
    int keep = 0;
    for (std::size_t i = 0; i < m_listed.size(); ++i) {
        m_members->addItem(QString::fromStdString(m_listed[i].name));
        if (m_listed[i].handle == chosen) keep = static_cast<int>(i);
    }
    m_members->setCurrentIndex(m_listed.empty() ? -1 : keep);
    ChosenChanged();
}

QCheckBox* HostPanel::roleBox(std::uint32_t role) const {
    for (const Bit& bit : m_roles)
        if (bit.value == role) return bit.box;
    return nullptr;
}

QCheckBox* HostPanel::privilegeBox(std::uint32_t value) const {
    for (const Bit& bit : m_privileges)
        if (bit.value == value) return bit.box;
    return nullptr;
}

void HostPanel::applyRoles() {
    Member member;
    if (!Chosen(&member)) return;
    const std::uint32_t roles = Word(m_roles);
    Act(member, [&] { ChSetRosters(member.handle, roles); });
}

void HostPanel::makeHost() {
    const std::uint32_t node = static_cast<std::uint32_t>(m_node->value());
    ForEachMember([node](const Member& m) { ChSetHost(m.handle, node); });
}

void HostPanel::makePresenter() {
    const std::uint32_t node = static_cast<std::uint32_t>(m_node->value());
    ForEachMember([node](const Member& m) { ChSetPresenter(m.handle, node); });
}

void HostPanel::applyPrivilege() {
    const std::uint32_t word = Word(m_privileges);
    ForEachMember([word](const Member& m) { ChSetPrivilege(m.handle, word); });
}

void HostPanel::applyPractice() {
    const signed char on = m_practice->isChecked() ? 1 : 0;
    ForEachMember([on](const Member& m) { ChSetPracticeStatus(m.handle, on); });
}

void HostPanel::applyQM() {
    const std::uint32_t word = m_features | (m_qm->isChecked() ? kQMFeature : 0);
    ForEachMember(
        [word](const Member& m) { ChSelectFeature(m.handle, word, 0, 0, 0, 0, nullptr); });
}

void HostPanel::applyRecording() {
    const std::uint32_t status = m_recording->isChecked() ? kRecording : kNotRecording;
    ForEachMember([status](const Member& m) { SetNBR2Status(m.handle, status, 1, 0); });
}

void HostPanel::leaveChosen() {
    Member member;
    if (!m_hooks.leave || !Chosen(&member)) return;
    m_hooks.leave(member);
    Refresh();
}

bool HostPanel::Chosen(Member* out) const {
    const int index = m_members->currentIndex();
    if (index < 0 || index >= static_cast<int>(m_listed.size())) return false;
    *out = m_listed[index];
    return true;
}

void HostPanel::ForEachMember(const std::function<void(const Member&)>& fn) const {
    if (!m_hooks.members) return;
    for (const Member& member : m_hooks.members())
        Act(member, [&] { fn(member); });
}

void HostPanel::Act(const Member& member, const std::function<void()>& fn) const {
    if (m_hooks.act) return m_hooks.act(member, fn);
    fn();
}

std::uint32_t HostPanel::Word(const std::vector<Bit>& bits) {
    std::uint32_t word = 0;
    for (const Bit& bit : bits)
        if (bit.box->isChecked()) word |= bit.value;
    return word;
}

void HostPanel::ChosenChanged() {
    Member member;
    if (!Chosen(&member)) return;
    m_node->setValue(static_cast<int>(member.nodeId));
}
