#include "ui/attendee_item.h"

void AttendeeItem::init(const QString& name, std::uint32_t userID) {
    setName(name);
    setID(userID);
}
