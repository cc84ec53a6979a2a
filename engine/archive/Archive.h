#pragma once
// The binary archive every stored record goes through.
//
// One Serialize(CArchive&) function per class both writes and reads: it calls the X* members in
// a fixed order and the archive either stores the value or reads it back into the same variable.
//
// Byte layout (little-endian, explicit widths): every member starts with a one-byte type code so
// that reading a member of the wrong kind is an error instead of garbage. Embedded objects
// (XData) and pointer objects (XPointer) are records with their byte length up front: AtEnd()
// tells a reader that the current record holds no more members (older records), and members a
// newer writer appended are skipped when a record is closed.

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <stdexcept>
#include <string>
#include <vector>

class CArchive;

// Base of every class that is stored through the archive.
class CSerializable {
  public:
    virtual ~CSerializable() = default;
    // The tag that names the class in a file ("ScoreMatrix", "SimBlock", ...).
    virtual const char* ClassTag() const = 0;
    virtual void Serialize(CArchive& ar) = 0;
};

// Declares the class tag inside a class body.
#define TB_CLASS_TAG(tag)                         \
    static constexpr const char* kClassTag = tag; \
    const char* ClassTag() const override {       \
        return tag;                               \
    }

class CArchiveException : public std::runtime_error {
  public:
    enum Cause {
        genericError,  // malformed data: bad length, impossible count, bad text
        endOfFile,     // the data ends inside a member or record
        badClass,      // unknown class tag, or an object of an unexpected class
        badSchema,     // a member of another kind than the reader expects
        tooDeep,       // records nested deeper than the archive accepts
        writeError,    // the file could not be written
    };
    CArchiveException(Cause cause, const std::string& detail);
    Cause GetCause() const { return m_cause; }
    // The text shown to the user for a failure while reading or writing `fileName`.
    std::string Report(const std::string& fileName) const;

  private:
    Cause m_cause;
};

// Registry from class tag to a factory, filled by static CClassLink objects that live in the
// source file of each stored class.
class CClassRegistry {
  public:
    using Factory = std::function<std::unique_ptr<CSerializable>()>;
    static void Add(const std::string& tag, Factory factory);
    // Null when the tag is unknown.
    static std::unique_ptr<CSerializable> Create(const std::string& tag);
    static bool IsKnown(const std::string& tag);
};

struct CClassLink {
    CClassLink(const char* tag, CClassRegistry::Factory factory) {
        CClassRegistry::Add(tag, std::move(factory));
    }
};

// Registers Class under its kClassTag; put it in the class's source file.
#define TB_REGISTER_CLASS(Class)                                  \
    static const CClassLink g_classLink_##Class(Class::kClassTag, \
                                                [] { return std::make_unique<Class>(); })

class CArchive {
  public:
    enum class Code : std::uint8_t {
        Int16 = 1,
        Int32 = 2,
        UInt32 = 3,
        Double = 4,
        String = 5,
        StringList = 6,
        Record = 7,
        Pointer = 8,
        NullPointer = 9,
        Bool = 10,
        Int64 = 11,
        Count = 12,
    };
    static constexpr int kMaxDepth = 64;

    // An archive that stores into a growing byte buffer (see Bytes()).
    static CArchive ForWriting();
    // An archive that reads `data` (the archive keeps its own copy).
    static CArchive ForReading(std::span<const std::uint8_t> data);

    bool IsLoading() const { return m_loading; }
    bool IsStoring() const { return !m_loading; }

    void XMember(std::int16_t& value);
    void XMember(std::int32_t& value);
    void XMember(std::uint32_t& value);
    void XMember(std::int64_t& value);
    void XMember(double& value);
    void XMember(bool& value);
    void XMember(std::string& value);
    void XMember(std::vector<std::string>& value);
    void XMember(std::vector<std::int32_t>& value);
    void XMember(std::vector<std::uint32_t>& value);
    void XMember(std::vector<double>& value);

    // An element count for a container the caller serialises itself. On reading, a negative
    // count, or one whose elements could not fit in the bytes left of the current record at
    // `minElementBytes` each, is a format error, so no allocation is ever sized by bad data.
    void XCount(std::size_t& count, std::size_t minElementBytes);

    // An embedded object, stored as a record of its own.
    template <class T>
    void XData(T& object) {
        BeginRecord();
        object.Serialize(*this);
        EndRecord();
    }

    // An embedded object whose own format errors stay inside its record: on reading, an archive
    // error raised by the object's members skips the rest of its record and the result is false
    // (the object is then half-read and must be replaced). Errors in the record's framing throw.
    template <class T>
    bool XDataContained(T& object) {
        BeginRecord();
        const std::size_t depth = m_recordEnds.size();
        try {
            object.Serialize(*this);
        } catch (const CArchiveException&) {
            if (IsStoring())
                throw;
            m_recordEnds.resize(depth);
            m_pos = m_recordEnds.back();
            m_recordEnds.pop_back();
            return false;
        }
        EndRecord();
        return true;
    }

    // An owned object pointer, stored with its class tag (or as a null pointer). On reading,
    // an object of the stored class is created; it must be a T.
    template <class T>
    void XPointer(std::unique_ptr<T>& pointer) {
        if (IsStoring()) {
            WritePointer(pointer.get());
            return;
        }
        std::unique_ptr<CSerializable> object = ReadPointer();
        if (!object) {
            pointer.reset();
            return;
        }
        T* typed = dynamic_cast<T*>(object.get());
        if (!typed) {
            throw CArchiveException(CArchiveException::badClass,
                                    std::string("object of class ") + object->ClassTag() +
                                        " where " + T::kClassTag + " was expected");
        }
        object.release();
        pointer.reset(typed);
        ReadPointerBody(*typed);
    }

    // A counted list of owned pointers; reading appends to the list.
    template <class T>
    void XObjectList(std::vector<std::unique_ptr<T>>& list) {
        std::size_t count = list.size();
        XCount(count, 1);
        if (IsStoring()) {
            for (auto& element : list)
                XPointer(element);
            return;
        }
        for (std::size_t i = 0; i < count; ++i) {
            std::unique_ptr<T> element;
            XPointer(element);
            list.push_back(std::move(element));
        }
    }

    // Reads data made of the string `signature` followed by one owned object of class T (the
    // layout of the program's files). Null when the data does not begin with the signature; a
    // missing object or damaged data is a format error.
    template <class T>
    static std::unique_ptr<T> ReadSigned(std::span<const std::uint8_t> data,
                                         const std::string& signature) {
        if (LeadingString(data) != signature)
            return nullptr;
        CArchive ar = ForReading(data);
        std::string found;
        ar.XMember(found);
        std::unique_ptr<T> object;
        ar.XPointer(object);
        if (!object) {
            throw CArchiveException(CArchiveException::genericError,
                                    std::string("no ") + T::kClassTag + " after the signature");
        }
        return object;
    }

    // On reading: the current record (or, at top level, the data) has no further members.
    bool AtEnd() const;

    // The bytes written so far (storing archives).
    const std::vector<std::uint8_t>& Bytes() const { return m_buffer; }

    // Reads the leading string of an archive without ever throwing: empty when the data does
    // not begin with a string member. Used to recognise files by their signature.
    static std::string LeadingString(std::span<const std::uint8_t> data);

  private:
    explicit CArchive(bool loading) : m_loading(loading) {}

    void BeginRecord();
    void EndRecord();
    void WritePointer(CSerializable* object);
    std::unique_ptr<CSerializable> ReadPointer();
    void ReadPointerBody(CSerializable& object);

    void WriteCode(Code code);
    void ExpectCode(Code code);
    void WriteRaw(const void* data, std::size_t size);
    void ReadRaw(void* data, std::size_t size);
    std::uint32_t ReadU32();
    void WriteU32(std::uint32_t value);
    std::string ReadStringBody();
    void WriteStringBody(const std::string& value);
    std::size_t Remaining() const;
    std::size_t Limit() const;

    bool m_loading;
    std::vector<std::uint8_t> m_buffer;
    std::size_t m_pos = 0;                    // read position
    std::vector<std::size_t> m_recordEnds;    // reading: end offsets of the open records
    std::vector<std::size_t> m_recordStarts;  // writing: offsets of the open records' lengths
};
