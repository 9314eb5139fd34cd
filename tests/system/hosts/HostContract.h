#pragma once

// What the manager needs of the host that it is built against, as code: whoever brings a host of their own
// compiles HostContract.cpp against it, and reads here what an error means. What these operations have to do
// is told by the conformance tests.

#include <AcdReader.h>
#include <PM_DEVKEY.h>
#include <PicConfig.h>
#include <Port_MsgManData.h>
#include <StringBase.h>
#include <TarvikException.h>
#include <TarvikSmokeMgr.h>
#include <UT_STR.h>

#include <concepts>
#include <cstddef>
#include <cstdint>
#include <type_traits>

namespace contract {

/// `StringBase`: a byte string with length. Any byte may stand in it, and a null text is the empty text. Moving
/// and comparing never fail: ordered containers of the manager rely on it.
template <typename Text>
concept String = std::copyable<Text> && std::is_nothrow_default_constructible_v<Text> &&
    std::is_nothrow_move_constructible_v<Text> && std::is_nothrow_move_assignable_v<Text> &&
    std::convertible_to<const char*, Text> && std::constructible_from<Text, const char*, std::size_t> &&
    requires(Text text, const Text& other, const char* bytes, std::size_t length, char byte) {
    text = bytes;
    text += bytes;
    text += other;
    text.Format("%d %s\n", 1, bytes);
    text.MakeUpper();
    text.MakeLower();
    text.Truncate(length);
    { other.c_str() }
    noexcept->std::same_as<const char*>;
    { other.GetLength() }
    noexcept->std::convertible_to<std::size_t>;
    { other.GetIndexOfFirstChar(byte, length) } -> std::convertible_to<std::size_t>;
    { Text::NOT_FOUND } -> std::convertible_to<std::size_t>;
    { other.Compare(other) }
    noexcept->std::convertible_to<int>;
    { other.ICompare(other) }
    noexcept->std::convertible_to<int>;
    { other == other }
    noexcept->std::convertible_to<bool>;
    { other != other }
    noexcept->std::convertible_to<bool>;
    { other.CRC32() }
    noexcept->std::convertible_to<std::uint32_t>;
    // A checksum taken piece by piece: the last argument is that of what went before.
    { Text::CRC32(bytes, length, std::uint32_t{}) }
    noexcept->std::convertible_to<std::uint32_t>;
};

/// `UT_STR`: operations on NUL-terminated texts, of which null is the empty one. None of the first three fails.
template <typename Text>
concept TextOperations = requires(const char* text) {
    { UT_STR::Compare(text, text) }
    noexcept->std::convertible_to<int>;
    { UT_STR::ICompare(text, text) }
    noexcept->std::convertible_to<int>;
    { UT_STR::AToL(text) }
    noexcept->std::convertible_to<long>;
    { UT_STR::Upper(text) } -> std::convertible_to<Text>;
};

/// `Port_MsgManData`: the message manager. Each operation takes a finished text in the format position, or a
/// printf format with its arguments.
template <typename Messages>
concept MessageManager = requires(const char* text, int line) {
    Messages::createObject(text, text, line, text).issueInfo("finished\n");
    Messages::createObject(text, text, line, text).issueInfo("%s %d\n", text, line);
    Messages::createObject(text, text, line, text).issueStatus("finished\n");
    Messages::createObject(text, text, line, text).issueStatus("%s %d\n", text, line);
    Messages::debugStub("finished\n");
    Messages::debugStub("%s %d\n", text, line);
};

/// The exceptions: raised by value, caught and reported by their base class. `report` is virtual.
template <typename Raised>
concept Exception = std::derived_from<Raised, TarvikException> && std::copy_constructible<Raised> &&
    std::has_virtual_destructor_v<Raised> &&
    std::constructible_from<Raised, const char*, const char*, const char*, int> &&
    requires(const Raised& raised) {
    raised.report();
};

/// `PM_DEVKEY`: reads keyed values. A text that it gives is valid until the next call on the accessor.
template <typename Accessor>
concept KeyAccessor = std::constructible_from<Accessor, const char*, PicConfig&, int, int, int> &&
    requires(Accessor accessor, const char* text, short index) {
    { accessor.getstringbykey(text, text, index, text, index) } -> std::same_as<const char*>;
};

/// `AcdReader`: opens the base database, or that of a name. Its accessor and its texts may go with it, but for
/// the accessor of the base database, which has to stay.
template <typename Reader>
concept DatabaseReader = std::default_initializable<Reader> && std::constructible_from<Reader, const char*> &&
    requires(const Reader& reader) {
    { reader.getDevkey() } -> std::convertible_to<PM_DEVKEY*>;
    { reader.getPM() } -> std::convertible_to<const char*>;
};

/// `PicConfig`: resolves a name. The module's name is null for a part that is not known.
template <typename Configuration>
concept PartConfiguration = std::derived_from<Configuration, PM_SPEC> &&
    std::constructible_from<Configuration, const char*, int, PM_PARTNAME_BINDING> &&
    requires(const PM_SPEC& part) {
    { part.get_pm() } -> std::convertible_to<const char*>;
};

/// `TarvikSmokeMgr`: records text. Finished pieces come in the format position.
template <typename Recorder>
concept SmokeRecorder = requires(Recorder recorder, const char* piece) {
    recorder.smokeStatus(piece);
    recorder.smokeStatus("%s %d\n", piece, 1);
};

} // namespace contract
