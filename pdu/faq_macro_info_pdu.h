// CFAQMacroInfoPDU: the participant's FAQ macro details (names, phone, e-mail) that the host
// hands over as configuration (main type 8). Only parsed; one object lives as long as the
// engine and takes every later configuration.
#pragma once

#include <string>

#include "pdu/kvo_chat_xml_pdu.h"

class CFAQMacroInfoPDU : public CKvoChatXMLPDU {
public:
    CFAQMacroInfoPDU();

    // 1 for any FAQ configuration: each of "fname", "lname", "phone" and "email" that has text
    // replaces its field; the others keep what an earlier configuration gave them.
    int ParseXMLPDU(const std::string& text) override;
    using CKvoChatXMLPDU::ParseXMLPDU;

    void SetFirstName(const std::string& strName) { m_strFirstName = strName; }
    void SetLastName(const std::string& strName) { m_strLastName = strName; }
    void SetPhoneNumber(const std::string& strPhone) { m_strPhoneNumber = strPhone; }
    void SetEmailAddress(const std::string& strEmail) { m_strEmailAddress = strEmail; }

    const std::string& GetFirstName() const { return m_strFirstName; }
    const std::string& GetLastName() const { return m_strLastName; }
    const std::string& GetPhoneNumber() const { return m_strPhoneNumber; }
    const std::string& GetEmailAddress() const { return m_strEmailAddress; }

private:
    std::string m_strFirstName;
    std::string m_strLastName;
    std::string m_strPhoneNumber;
    std::string m_strEmailAddress;
};
