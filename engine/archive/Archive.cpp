#include "archive/Archive.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <map>

namespace {

std::string CauseText(CArchiveException::Cause cause) {
    switch (cause) {
        case CArchiveException::endOfFile:
            return "Unexpected end of file.";
        case CArchiveException::badClass:
            return "Unknown object type in file.";
        case CArchiveException::badSchema:
            return "File format not supported (version error).";
        case CArchiveException::tooDeep:
            return "File format not supported (records nested too deeply).";
        case CArchiveException::writeError:
            return "An error occurred while writing the file.";
        case CArchiveException::genericError:
            break;
    }
    return "Unexpected file format.";
}

std::map<std::string, CClassRegistry::Factory>& Registry() {
    static std::map<std::string, CClassRegistry::Factory> registry;
    return registry;
}

}  // namespace

CArchiveException::CArchiveException(Cause cause, const std::string& detail)
    : std::runtime_error(CauseText(cause) + " (" + detail + ")"), m_cause(cause) {}

std::string CArchiveException::Report(const std::string& fileName) const {
    return fileName + "\n" + CauseText(m_cause);
}

void CClassRegistry::Add(const std::string& tag, Factory factory) {
    Registry()[tag] = std::move(factory);
}

std::unique_ptr<CSerializable> CClassRegistry::Create(const std::string& tag) {
    auto it = Registry().find(tag);
    return it == Registry().end() ? nullptr : it->second();
}

bool CClassRegistry::IsKnown(const std::string& tag) { return Registry().count(tag) != 0; }

CArchive CArchive::ForWriting() { return CArchive(false); }

CArchive CArchive::ForReading(std::span<const std::uint8_t> data) {
    CArchive ar(true);
    ar.m_buffer.assign(data.begin(), data.end());
    return ar;
}

std::size_t CArchive::Limit() const {
    return m_recordEnds.empty() ? m_buffer.size() : m_recordEnds.back();
}

std::size_t CArchive::Remaining() const { return Limit() - m_pos; }

bool CArchive::AtEnd() const { return !m_loading || m_pos >= Limit(); }

void CArchive::WriteRaw(const void* data, std::size_t size) {
    const auto* bytes = static_cast<const std::uint8_t*>(data);
    m_buffer.insert(m_buffer.end(), bytes, bytes + size);
}

void CArchive::ReadRaw(void* data, std::size_t size) {
    if (size > Remaining()) {
        throw CArchiveException(CArchiveException::endOfFile, "member runs past its record");
    }
    std::memcpy(data, m_buffer.data() + m_pos, size);
    m_pos += size;
}

// The host is little-endian (x86-64 and AArch64 Linux); values are copied byte for byte.
static_assert(std::endian::native == std::endian::little, "archive assumes a little-endian host");

void CArchive::WriteU32(std::uint32_t value) { WriteRaw(&value, sizeof value); }

std::uint32_t CArchive::ReadU32() {
    std::uint32_t value = 0;
    ReadRaw(&value, sizeof value);
    return value;
}

void CArchive::WriteCode(Code code) { WriteRaw(&code, 1); }

void CArchive::ExpectCode(Code code) {
    std::uint8_t found = 0;
    ReadRaw(&found, 1);
    if (found != static_cast<std::uint8_t>(code)) {
        throw CArchiveException(CArchiveException::badSchema,
                                "member of kind " + std::to_string(found) + " where kind " +
                                    std::to_string(static_cast<int>(code)) + " was expected");
    }
}

void CArchive::WriteStringBody(const std::string& value) {
    if (value.size() > UINT32_MAX) {
        throw CArchiveException(CArchiveException::writeError, "string too long");
    }
    WriteU32(static_cast<std::uint32_t>(value.size()));
    WriteRaw(value.data(), value.size());
}

std::string CArchive::ReadStringBody() {
    std::uint32_t length = ReadU32();
    if (length > Remaining()) {
        throw CArchiveException(CArchiveException::endOfFile, "string runs past its record");
    }
    std::string value(reinterpret_cast<const char*>(m_buffer.data() + m_pos), length);
    m_pos += length;
    return value;
}

#define TB_SCALAR_MEMBER(Type, CodeName)    \
    void CArchive::XMember(Type& value) {   \
        if (m_loading) {                    \
            ExpectCode(Code::CodeName);     \
            ReadRaw(&value, sizeof value);  \
        } else {                            \
            WriteCode(Code::CodeName);      \
            WriteRaw(&value, sizeof value); \
        }                                   \
    }

TB_SCALAR_MEMBER(std::int16_t, Int16)
TB_SCALAR_MEMBER(std::int32_t, Int32)
TB_SCALAR_MEMBER(std::uint32_t, UInt32)
TB_SCALAR_MEMBER(std::int64_t, Int64)
TB_SCALAR_MEMBER(double, Double)
#undef TB_SCALAR_MEMBER

void CArchive::XMember(bool& value) {
    std::uint8_t byte = value ? 1 : 0;
    if (m_loading) {
        ExpectCode(Code::Bool);
        ReadRaw(&byte, 1);
        if (byte > 1) throw CArchiveException(CArchiveException::genericError, "bad boolean");
        value = byte == 1;
    } else {
        WriteCode(Code::Bool);
        WriteRaw(&byte, 1);
    }
}

void CArchive::XMember(std::string& value) {
    if (m_loading) {
        ExpectCode(Code::String);
        value = ReadStringBody();
    } else {
        WriteCode(Code::String);
        WriteStringBody(value);
    }
}

void CArchive::XCount(std::size_t& count, std::size_t minElementBytes) {
    if (!m_loading) {
        if (count > INT32_MAX) throw CArchiveException(CArchiveException::writeError, "count");
        WriteCode(Code::Count);
        WriteU32(static_cast<std::uint32_t>(count));
        return;
    }
    ExpectCode(Code::Count);
    std::uint32_t stored = ReadU32();
    if (stored > INT32_MAX || (minElementBytes > 0 && stored > Remaining() / minElementBytes)) {
        throw CArchiveException(CArchiveException::genericError,
                                "count " + std::to_string(stored) + " cannot fit in the data");
    }
    count = stored;
}

void CArchive::XMember(std::vector<std::string>& value) {
    std::size_t count = value.size();
    XCount(count, 5);
    if (m_loading) {
        value.assign(count, std::string());
    }
    for (auto& element : value) XMember(element);
}

namespace {

// Counted arrays of plain numbers: the count, then the elements, each with its type code.
template <class T>
void CountedArray(CArchive& ar, std::vector<T>& value) {
    std::size_t count = value.size();
    ar.XCount(count, 1 + sizeof(T));
    if (ar.IsLoading()) value.assign(count, T{});
    for (auto& element : value) ar.XMember(element);
}

}  // namespace

void CArchive::XMember(std::vector<std::int32_t>& value) { CountedArray(*this, value); }
void CArchive::XMember(std::vector<std::uint32_t>& value) { CountedArray(*this, value); }
void CArchive::XMember(std::vector<double>& value) { CountedArray(*this, value); }

void CArchive::BeginRecord() {
    if (!m_loading) {
        if (m_recordStarts.size() >= kMaxDepth) {
            throw CArchiveException(CArchiveException::tooDeep, "records nested too deeply");
        }
        WriteCode(Code::Record);
        m_recordStarts.push_back(m_buffer.size());
        WriteU32(0);  // patched by EndRecord
        return;
    }
    ExpectCode(Code::Record);
    std::uint32_t length = ReadU32();
    if (length > Remaining()) {
        throw CArchiveException(CArchiveException::endOfFile, "record runs past its container");
    }
    if (m_recordEnds.size() >= kMaxDepth) {
        throw CArchiveException(CArchiveException::tooDeep, "records nested too deeply");
    }
    m_recordEnds.push_back(m_pos + length);
}

void CArchive::EndRecord() {
    if (!m_loading) {
        std::size_t start = m_recordStarts.back();
        m_recordStarts.pop_back();
        std::size_t length = m_buffer.size() - start - sizeof(std::uint32_t);
        if (length > UINT32_MAX) throw CArchiveException(CArchiveException::writeError, "size");
        auto length32 = static_cast<std::uint32_t>(length);
        std::memcpy(m_buffer.data() + start, &length32, sizeof length32);
        return;
    }
    // Members appended by a newer writer are skipped.
    m_pos = m_recordEnds.back();
    m_recordEnds.pop_back();
}

void CArchive::WritePointer(CSerializable* object) {
    if (!object) {
        WriteCode(Code::NullPointer);
        return;
    }
    WriteCode(Code::Pointer);
    WriteStringBody(object->ClassTag());
    BeginRecord();
    object->Serialize(*this);
    EndRecord();
}

std::unique_ptr<CSerializable> CArchive::ReadPointer() {
    std::uint8_t code = 0;
    ReadRaw(&code, 1);
    if (code == static_cast<std::uint8_t>(Code::NullPointer)) return nullptr;
    if (code != static_cast<std::uint8_t>(Code::Pointer)) {
        throw CArchiveException(CArchiveException::badSchema,
                                "member of kind " + std::to_string(code) + " where an object "
                                "pointer was expected");
    }
    std::string tag = ReadStringBody();
    std::unique_ptr<CSerializable> object = CClassRegistry::Create(tag);
    if (!object) {
        throw CArchiveException(CArchiveException::badClass, "unknown class tag '" + tag + "'");
    }
    return object;
}

void CArchive::ReadPointerBody(CSerializable& object) {
    BeginRecord();
    object.Serialize(*this);
    EndRecord();
}

std::string CArchive::LeadingString(std::span<const std::uint8_t> data) {
    try {
        CArchive ar = ForReading(data.subspan(0, std::min<std::size_t>(data.size(), 4096)));
        std::string value;
        ar.XMember(value);
        return value;
    } catch (const CArchiveException&) {
        return {};
    }
}
