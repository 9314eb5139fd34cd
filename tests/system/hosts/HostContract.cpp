#include "HostContract.h"

// Compiled against each host that there is.

static_assert(contract::String<StringBase>);
static_assert(contract::TextOperations<StringBase>);
static_assert(contract::MessageManager<Port_MsgManData>);

static_assert(contract::Exception<LogicException>);
static_assert(contract::Exception<DataMismatchException>);
static_assert(contract::Exception<OutOfRangeException>);
static_assert(contract::Exception<DataNotFoundException>);
static_assert(std::derived_from<TarvikException, Port::Exception>);
static_assert(std::derived_from<DataMismatchException, LogicException>);
static_assert(std::derived_from<OutOfRangeException, LogicException>);
static_assert(std::derived_from<DataNotFoundException, LogicException>);

static_assert(contract::KeyAccessor<PM_DEVKEY>);
static_assert(contract::DatabaseReader<AcdReader>);
static_assert(contract::PartConfiguration<PicConfig>);
static_assert(contract::SmokeRecorder<TarvikSmokeMgr>);
