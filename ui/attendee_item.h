// One row of the attendee picker: a display name and the attendee's node id.
#pragma once

#include <QString>
#include <QVariantMap>
#include <cstdint>

class AttendeeItem {
public:
    AttendeeItem(const QString& name, std::uint32_t userID) { init(name, userID); }

    void init(const QString& name, std::uint32_t userID);
    QString name() const { return m_properties.value("Name").toString(); }
    void setName(const QString& name) { m_properties["Name"] = name; }
    std::uint32_t lID() const { return m_properties.value("id").toUInt(); }
    void setID(std::uint32_t id) { m_properties["id"] = id; }
    const QVariantMap& Properties() const { return m_properties; }

private:
    QVariantMap m_properties;  // "Name" and "id"
};
