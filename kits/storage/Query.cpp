#include <Query.h>

#include <AppDefs.h>
#include <Entry.h>
#include <FoundEntry.h>
#include <HostConversions.h>
#include <Message.h>
#include <NodeMonitor.h>
#include <PredicateBuilder.h>
#include <PredicateParser.h>
#include <PredicatePrinter.h>
#include <String.h>
#include <Volume.h>

#include "host/api/index.h"

#include <DateText.h>

#include <math.h>
#include <string.h>

namespace {

constexpr dev_t kNoVolume = static_cast<dev_t>(-1);

// Runs on a thread of the host's: a target that is full loses the message, rather than the host being held
// up.
void SendUpdate(const BMessenger& target, const host::QueryUpdate& update) {
    BMessage message(B_QUERY_UPDATE);
    bool entered = update.change == host::QueryUpdate::Change::entered;
    message.AddInt32("opcode", entered ? B_ENTRY_CREATED : B_ENTRY_REMOVED);
    message.AddString("name", update.ref.leaf.c_str());
    message.AddInt64("directory", static_cast<int64>(update.ref.directory));
    message.AddInt64("device", static_cast<int64>(update.ref.device));
    message.AddInt64("node", static_cast<int64>(update.inode));
    target.SendMessage(&message, static_cast<BHandler*>(nullptr), 0);
}

} // namespace

struct BQuery::State {
    dev_t device = kNoVolume;
    PredicateBuilder builder;
    std::string text;
    bool hasText = false;
    BMessenger target;
    bool isLive = false;
    std::unique_ptr<host::RunningQuery> running;
    std::unique_ptr<FoundEntry> pending;

    bool IsFetched() const { return running != nullptr; }

    // The condition as a text: what was given, or what the pushed parts amount to.
    status_t Text(std::string& result) const {
        if (hasText) {
            result = text;
            return B_OK;
        }
        PredicateRef predicate;
        status_t status = builder.Build(predicate);
        if (status == B_OK)
            result = PrintPredicate(*predicate);
        return status;
    }

    status_t Condition(PredicateRef& predicate) const {
        if (!hasText)
            return builder.Build(predicate);
        predicate = ParsePredicate(text, ::time(nullptr)).predicate;
        return predicate != nullptr ? B_OK : B_BAD_VALUE;
    }

    status_t Push(host::Predicate::Value value,
                  host::Predicate::Case letterCase = host::Predicate::Case::sensitive) {
        if (IsFetched())
            return B_NOT_ALLOWED;
        DropText();
        builder.PushValue(std::move(value), letterCase);
        return B_OK;
    }

    void DropText() {
        text.clear();
        hasText = false;
    }

    status_t Next(FoundEntry& entry) {
        if (!IsFetched())
            return B_FILE_ERROR;
        if (pending != nullptr) {
            entry = std::move(*pending);
            pending.reset();
            return B_OK;
        }
        host::RunningQuery::Hit hit;
        host::Status status = running->next(hit);
        if (status)
            entry = {std::move(hit.ref), hit.inode};
        return StatusOf(status);
    }
};

BQuery::BQuery() : mState(std::make_unique<State>()) {}

BQuery::~BQuery() = default;

status_t BQuery::Clear() {
    mState = std::make_unique<State>();
    return B_OK;
}

status_t BQuery::PushAttr(const char* attribute) {
    if (attribute == nullptr || attribute[0] == '\0')
        return B_BAD_VALUE;
    if (mState->IsFetched())
        return B_NOT_ALLOWED;
    mState->DropText();
    mState->builder.PushAttribute(attribute);
    return B_OK;
}

status_t BQuery::PushOp(query_op op) {
    if (mState->IsFetched())
        return B_NOT_ALLOWED;
    mState->DropText();
    return mState->builder.PushOperator(op);
}

status_t BQuery::PushUInt32(uint32 value) {
    return mState->Push(static_cast<std::int64_t>(value));
}

status_t BQuery::PushInt32(int32 value) {
    return mState->Push(static_cast<std::int64_t>(value));
}

status_t BQuery::PushUInt64(uint64 value) {
    return mState->Push(static_cast<std::uint64_t>(value));
}

status_t BQuery::PushInt64(int64 value) {
    return mState->Push(static_cast<std::int64_t>(value));
}

status_t BQuery::PushFloat(float value) {
    return PushDouble(static_cast<double>(value));
}

status_t BQuery::PushDouble(double value) {
    return isfinite(value) ? mState->Push(value) : B_BAD_VALUE;
}

status_t BQuery::PushString(const char* value, bool caseInsensitive) {
    if (value == nullptr)
        return B_BAD_VALUE;
    using Case = host::Predicate::Case;
    return mState->Push(std::string(value), caseInsensitive ? Case::insensitive : Case::sensitive);
}

status_t BQuery::PushDate(const char* date) {
    if (date == nullptr)
        return B_BAD_VALUE;
    std::optional<time_t> time = TimeFromText(date, ::time(nullptr));
    return time ? mState->Push(static_cast<std::int64_t>(*time)) : B_BAD_VALUE;
}

status_t BQuery::SetVolume(const BVolume* volume) {
    if (volume == nullptr || volume->InitCheck() != B_OK)
        return B_BAD_VALUE;
    if (mState->IsFetched())
        return B_NOT_ALLOWED;
    mState->device = volume->Device();
    return B_OK;
}

status_t BQuery::SetPredicate(const char* expression) {
    if (expression == nullptr)
        return B_BAD_VALUE;
    if (mState->IsFetched())
        return B_NOT_ALLOWED;
    mState->builder.MakeEmpty();
    mState->text = expression;
    mState->hasText = true;
    return B_OK;
}

status_t BQuery::SetTarget(BMessenger target) {
    if (mState->IsFetched())
        return B_NOT_ALLOWED;
    mState->target = target;
    mState->isLive = target.IsValid();
    return B_OK;
}

bool BQuery::IsLive() const {
    return mState->isLive;
}

status_t BQuery::GetPredicate(char* buffer, size_t length) {
    if (buffer == nullptr)
        return B_BAD_VALUE;
    std::string text;
    if (status_t status = mState->Text(text); status != B_OK)
        return status;
    if (text.size() >= length)
        return B_BAD_VALUE;
    memcpy(buffer, text.c_str(), text.size() + 1);
    return B_OK;
}

status_t BQuery::GetPredicate(BString* predicate) {
    if (predicate == nullptr)
        return B_BAD_VALUE;
    std::string text;
    status_t status = mState->Text(text);
    if (status == B_OK)
        predicate->SetTo(text.c_str());
    return status;
}

size_t BQuery::PredicateLength() {
    std::string text;
    return mState->Text(text) == B_OK ? text.size() + 1 : 0;
}

dev_t BQuery::TargetDevice() const {
    return mState->device;
}

status_t BQuery::Fetch() {
    if (mState->IsFetched())
        return B_NOT_ALLOWED;
    PredicateRef predicate;
    status_t status = mState->Condition(predicate);
    if (status != B_OK)
        return status;
    if (mState->device == kNoVolume)
        return B_NO_INIT;
    host::QueryListener listener;
    if (mState->isLive)
        listener = [target = mState->target](const host::QueryUpdate& update) { SendUpdate(target, update); };
    host::Result<std::unique_ptr<host::RunningQuery>> running =
        host::indexes().query(mState->device, std::move(predicate), std::move(listener));
    if (!running)
        return running.error() == ENODEV ? B_BAD_VALUE : StatusOf(running);
    mState->running = *std::move(running);
    return B_OK;
}

status_t BQuery::GetNextEntry(BEntry* entry, bool traverse) {
    if (entry == nullptr)
        return B_BAD_VALUE;
    entry_ref ref;
    status_t status = GetNextRef(&ref);
    for (; status == B_OK; status = GetNextRef(&ref)) {
        if (entry->SetTo(&ref, traverse) == B_OK)
            return B_OK;
    }
    entry->Unset();
    return status;
}

status_t BQuery::GetNextRef(entry_ref* ref) {
    if (ref == nullptr)
        return B_BAD_VALUE;
    FoundEntry entry;
    status_t status = mState->Next(entry);
    if (status == B_OK)
        *ref = KitRef(entry.ref);
    return status;
}

int32 BQuery::GetNextDirents(struct dirent* buffer, size_t length, int32 count) {
    return FillDirents(
        buffer, length, count, [this](FoundEntry& entry) { return mState->Next(entry); }, mState->pending);
}

status_t BQuery::Rewind() {
    if (!mState->IsFetched())
        return B_FILE_ERROR;
    mState->pending.reset();
    return StatusOf(mState->running->rewind());
}

int32 BQuery::CountEntries() {
    return B_ERROR;
}
