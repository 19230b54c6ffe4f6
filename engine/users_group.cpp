#include "engine/users_group.h"

#include <cstdlib>
#include <cstring>
#include <string>

#include "kyutil/bstream.h"
#include "kyutil/safe_mem.h"

namespace {

// An array-allocated copy of text, or null for a null text.
std::unique_ptr<char[]> CopyText(const char* text) {
    if (!text) return nullptr;
    const std::size_t size = std::strlen(text) + 1;
    std::unique_ptr<char[]> copy(new char[size]);
    std::memcpy(copy.get(), text, size);
    return copy;
}

// Frees what ReadString hands out.
struct FreeDeleter {
    void operator()(char* text) const { std::free(text); }
};
using StreamText = std::unique_ptr<char, FreeDeleter>;

}  // namespace

CUsersGroup::CUsersGroup() : m_pCache(new CacheRecord) {}

CUsersGroup::~CUsersGroup() {
    DeleteAllMembers();
}

CUsersGroup::CUsersGroup(const CUsersGroup& other) : CUsersGroup() {
    *this = other;
}

CUsersGroup& CUsersGroup::operator=(const CUsersGroup& other) {
    if (this == &other) return *this;
    m_nFirstRow = other.m_nFirstRow;
    m_dwGroupType = other.m_dwGroupType;
    m_dwGroupId = other.m_dwGroupId;
    m_pszName = CopyText(other.m_pszName.get());
    m_pszLabel = CopyText(other.m_pszLabel.get());
    m_pszFactName = CopyText(other.m_pszFactName.get());
    m_pszPrivateChatLabel = CopyText(other.m_pszPrivateChatLabel.get());
    m_dwFlags = other.m_dwFlags;
    m_dwValueA = other.m_dwValueA;
    m_dwValueB = other.m_dwValueB;
    m_dwFlagBit1 = other.m_dwFlagBit1;
    m_dwFlagBit2 = other.m_dwFlagBit2;
    m_dwFlagBit3 = other.m_dwFlagBit3;
    m_bListed = other.m_bListed;
    m_dwReserved1 = other.m_dwReserved1;
    m_dwSequence = other.m_dwSequence;
    m_nInsertPosition = other.m_nInsertPosition;
    m_dwReserved2 = other.m_dwReserved2;
    m_pCache.reset(other.m_pCache ? new CacheRecord(*other.m_pCache) : nullptr);
    m_bNeedSendGroupInfo = other.m_bNeedSendGroupInfo;
    m_bSubscribed = other.m_bSubscribed;
    m_nRequestType = other.m_nRequestType;
    m_bCacheSet = other.m_bCacheSet;
    DeleteAllMembers();
    for (std::int32_t i = 0; i < other.GetMemberCount(); ++i)
        AddAMember(other.GetMember(i));
    std::memcpy(m_Reserved, other.m_Reserved, sizeof(m_Reserved));
    return *this;
}

const char* CUsersGroup::SetGrpName(const char* name) {
    if (!name) return nullptr;
    m_pszName = CopyText(name);
    return m_pszName.get();
}

const char* CUsersGroup::SetGrpLabel(const char* label) {
    if (!label) return nullptr;
    m_pszLabel = CopyText(label);
    return m_pszLabel.get();
}

const char* CUsersGroup::SetPrivateChatLabel(const char* text) {
    m_pszPrivateChatLabel.reset();
    if (text && m_pszLabel) m_pszPrivateChatLabel = CopyText(text);
    return m_pszPrivateChatLabel.get();
}

void CUsersGroup::SetGroupNameLabel(const char* name, const char* label) {
    SetGrpName(name);
    SetGrpLabel(label);
}

const char* CUsersGroup::SetFactName(const char* text) {
    // A missing text or name counts as empty.
    const std::string fact =
        std::string(text ? text : "") + "(|(" + (m_pszName ? m_pszName.get() : "") + ")|)";
    m_pszFactName.reset(new char[fact.size() + 1]);
    std::memcpy(m_pszFactName.get(), fact.c_str(), fact.size() + 1);
    return m_pszFactName.get();
}

void CUsersGroup::SetCacheName(const char* name) {
    if (m_pCache) SafeCopyText(m_pCache->szName, sizeof(m_pCache->szName), name);
}

void CUsersGroup::SetCacheHandle(std::uint32_t handle) {
    if (m_pCache) m_pCache->dwHandle = handle;
}

const char* CUsersGroup::GetCacheName() const {
    return m_pCache ? m_pCache->szName : nullptr;
}

std::uint32_t CUsersGroup::GetCacheHandle() const {
    return m_pCache ? m_pCache->dwHandle : 0;
}

int CUsersGroup::AddAMember(std::uint32_t nodeId) {
    std::unique_ptr<std::uint32_t> member(new std::uint32_t(nodeId));
    if (!m_Members.Add(member.get())) return 0;
    member.release();
    return 1;
}

int CUsersGroup::InsertAMember(std::uint32_t nodeId, std::int32_t position) {
    if (position < 0 || position > m_Members.GetCount()) return 0;
    std::unique_ptr<std::uint32_t> member(new std::uint32_t(nodeId));
    if (!m_Members.InsertAt(position, member.get())) return 0;
    member.release();
    return 1;
}

int CUsersGroup::RemoveAMember(std::uint32_t nodeId) {
    const std::int32_t position = IsUserInTheGroup(nodeId);
    if (position < 0) return 0;
    delete static_cast<std::uint32_t*>(m_Members[position]);
    m_Members.RemoveAt(position);
    return 1;
}

std::int32_t CUsersGroup::IsUserInTheGroup(std::uint32_t nodeId) const {
    for (std::int32_t i = 0; i < m_Members.GetCount(); ++i) {
        if (GetMember(i) == nodeId) return i;
    }
    return -1;
}

void CUsersGroup::SetGroupMembers(std::uint32_t count, const std::uint32_t* const* members) {
    if (count == 0 || !members || !members[0]) return;
    for (std::uint32_t i = 0; i < count; ++i) {
        if (members[i]) AddAMember(*members[i]);
    }
}

std::uint32_t CUsersGroup::GetMember(std::int32_t position) const {
    const auto* member = static_cast<const std::uint32_t*>(m_Members[position]);
    return member ? *member : 0;
}

int CUsersGroup::DeleteMembers() {
    Clear();
    return 1;
}

int CUsersGroup::SetGroup(const unsigned char* data, std::uint32_t size) {
    Clear();
    // A stream of capacity 0 would be unbounded, so empty data is refused here.
    if (!data || size == 0) return 0;
    // The stream only reads here; it wants a writable pointer for its other uses.
    CByteStream stream(const_cast<unsigned char*>(data), size);
    std::uint32_t type = 0;
    stream >> type;
    if (stream.Failed()) return 0;
    m_dwGroupType = type;
    if (type == 2) return 1;

    std::uint32_t groupId = 0;
    stream >> groupId;
    if (stream.Failed()) return 0;
    m_dwGroupId = groupId;

    const StreamText name(stream.ReadString());
    if (!name) return 0;
    const StreamText label(stream.ReadString());
    if (!label) return 0;
    std::uint32_t count = 0;
    stream >> count;
    // A count the remaining bytes cannot hold is refused before any member is read.
    if (stream.Failed() || count == 0 || count > stream.Available() / sizeof(std::uint32_t)) {
        return 0;
    }
    SetGrpName(name.get());
    SetGrpLabel(label.get());
    for (std::uint32_t i = 0; i < count; ++i) {
        std::uint32_t member = 0;
        stream >> member;
        AddAMember(member);
    }
    return 1;
}

void CUsersGroup::SetFlags(std::uint32_t flags, bool bPacked) {
    if (!bPacked) {
        m_dwFlags = flags;
        return;
    }
    m_dwFlags = flags & 0x1;
    m_dwFlagBit1 = (flags >> 1) & 0x1;
    m_dwFlagBit2 = (flags >> 2) & 0x1;
    m_dwFlagBit3 = (flags >> 3) & 0x1;
    m_bListed = (flags >> 4) & 0x1;
}

bool CUsersGroup::HasReservedArea() const {
    for (unsigned char byte : m_Reserved) {
        if (byte != 0) return true;
    }
    return false;
}

void CUsersGroup::Clear() {
    m_pCache.reset();
    m_pszFactName.reset();
    m_pszName.reset();
    m_pszLabel.reset();
    m_pszPrivateChatLabel.reset();
    DeleteAllMembers();
}

void CUsersGroup::DeleteAllMembers() {
    for (std::int32_t i = 0; i < m_Members.GetCount(); ++i) {
        delete static_cast<std::uint32_t*>(m_Members[i]);
    }
    m_Members.RemoveAll();
}
