// Arbitrary text in a status, arbitrary members, and every way a host's resize operation may
// behave: the text stays within its capacity, and what was written can be read back.

#include <algorithm>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <vector>

#include "FuzzInput.h"
#include "errors/ErrorText.h"

#include <cjson/cJSON.h>

namespace {

using Document = std::unique_ptr<cJSON, decltype(&cJSON_Delete)>;

enum class Behaviour : std::uint8_t {
    exact,
    growsOnce,
    refuses,
    succeedsWithoutGrowing,
    losesTheTextToGarbage,
    losesTheTextToZeros,
    startsAnew,
    forgetsTheText,
    throws,
    end
};

Behaviour behaviour = Behaviour::exact;
int calls = 0;

bool allocate(zeerr_Status* status, std::uint32_t size, int filler, bool keepText) {
    if (size > 0x100000) {
        return false;
    }
    char* const text = static_cast<char*>(std::malloc(size));
    std::memset(text, filler, size);
    if (keepText && status->json != nullptr) {
        std::memcpy(text, status->json, std::min(size, status->capacity));
    }
    std::free(status->json);
    status->json = text;
    status->capacity = size;
    return true;
}

bool hostResize(zeerr_Status* status, std::uint32_t size) {
    constexpr int garbage = 0xa5;
    if (size == 0) {
        std::free(status->json);
        status->json = nullptr;
        status->capacity = 0;
        return true;
    }
    ++calls;
    switch (behaviour) {
    case Behaviour::exact:
        return allocate(status, size, garbage, true);
    case Behaviour::growsOnce:
        return calls == 1 && allocate(status, size, garbage, true);
    case Behaviour::succeedsWithoutGrowing:
        return true;
    case Behaviour::losesTheTextToGarbage:
        return allocate(status, size, garbage, false);
    case Behaviour::losesTheTextToZeros:
        return allocate(status, size, 0, false);
    case Behaviour::startsAnew:
        if (!allocate(status, size, garbage, false)) {
            return false;
        }
        std::strcpy(status->json, "{}");
        return true;
    case Behaviour::forgetsTheText:
        std::free(status->json);
        status->json = nullptr;
        status->capacity = 0;
        return true;
    case Behaviour::throws:
        throw std::runtime_error("no");
    default:
        return false;
    }
}

bool keepsTheText(zeerr_Resize resize) {
    return resize == &zeerr::defaultResize || behaviour == Behaviour::exact ||
           behaviour == Behaviour::growsOnce;
}

/// The default operation releases with delete[]: the text that it starts with must suit it.
void setText(zeerr::Status& status, const std::string& text, std::uint32_t room) {
    const auto capacity = static_cast<std::uint32_t>(text.size()) + room;
    if (capacity == 0 || !status.resize) {
        return;
    }
    if (status.resize == &zeerr::defaultResize) {
        status.json = new char[capacity];
    } else {
        status.json = static_cast<char*>(std::malloc(capacity));
    }
    std::memset(status.json, 0xa5, capacity);
    std::memcpy(status.json, text.data(), text.size());
    if (room > 0) {
        status.json[text.size()] = '\0';
    }
    status.capacity = capacity;
}

/// The members as they are expected, built apart from the code under test.
class Model {
public:
    void addString(const std::string& key, const std::string& value) {
        cJSON_AddStringToObject(open_.back(), key.c_str(), value.c_str());
    }
    void addInt(const std::string& key, int value) {
        cJSON_AddNumberToObject(open_.back(), key.c_str(), value);
    }
    void addObject(const std::string& key) {
        open_.push_back(cJSON_AddObjectToObject(open_.back(), key.c_str()));
    }
    void leaveObject() { open_.pop_back(); }
    std::size_t depth() const { return open_.size(); }
    const cJSON* members() const { return root_->child; }

private:
    Document root_{cJSON_CreateObject(), &cJSON_Delete};
    std::vector<cJSON*> open_{root_.get()};
};

bool sameMembers(const cJSON* left, const cJSON* right) {
    for (; left != nullptr && right != nullptr; left = left->next, right = right->next) {
        const bool same =
            left->type == right->type && std::strcmp(left->string, right->string) == 0 &&
            left->valueint == right->valueint &&
            (!cJSON_IsString(left) || std::strcmp(left->valuestring, right->valuestring) == 0) &&
            sameMembers(left->child, right->child);
        if (!same) {
            return false;
        }
    }
    return left == right;
}

std::size_t count(const cJSON* member) {
    std::size_t members = 0;
    for (; member != nullptr; member = member->next) {
        ++members;
    }
    return members;
}

const cJSON* lastMembers(const cJSON* root, std::size_t wanted) {
    const cJSON* member = root->child;
    for (std::size_t all = count(member); all > wanted; --all) {
        member = member->next;
    }
    return member;
}

void requireTerminated(const zeerr::Status& status) {
    require(status.json == nullptr || std::memchr(status.json, '\0', status.capacity) != nullptr,
            "the text ends within its capacity");
}

char* writeMember(FuzzInput& input, char* position, Model& model, zeerr::Resizer& resizer) {
    constexpr std::size_t deepest = 100;
    const unsigned kind = input.octet() % 4U;
    if (kind == 3) {
        if (model.depth() == 1) {
            return position;
        }
        model.leaveObject();
        return zeerr::leaveObject(position);
    }
    const std::string key = input.text();
    if (kind == 0) {
        const std::string value = input.text();
        model.addString(key, value);
        return zeerr::addString(position, key, value, resizer);
    }
    if (kind == 2 && model.depth() < deepest) {
        model.addObject(key);
        return zeerr::addObject(position, key, resizer);
    }
    const auto value = static_cast<std::int32_t>(input.integer());
    model.addInt(key, value);
    return zeerr::addInt(position, key, value, resizer);
}

zeerr_Resize chooseResize(FuzzInput& input) {
    const unsigned choice = input.octet() % (static_cast<unsigned>(Behaviour::end) + 2U);
    behaviour = static_cast<Behaviour>(choice);
    calls = 0;
    if (choice == static_cast<unsigned>(Behaviour::end)) {
        return nullptr;
    }
    return behaviour < Behaviour::end ? &hostResize : &zeerr::defaultResize;
}

} // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    FuzzInput input(data, size);
    zeerr::Status status{-1, 0, chooseResize(input), nullptr};
    const std::uint32_t room = input.octet();
    const std::string text = input.text();
    setText(status, text, room);

    const Document before(
        cJSON_ParseWithLengthOpts(text.data(), strnlen(text.data(), text.size()), nullptr, 0),
        &cJSON_Delete);
    zeerr::Resizer resizer(status);
    Model model;
    char* position = zeerr::beginMembers(status);
    while (position != nullptr && !input.atEnd()) {
        position = writeMember(input, position, model, resizer);
        requireTerminated(status);
    }
    require(status.code == -1, "the code stays");
    if (position != nullptr && keepsTheText(status.resize) && cJSON_IsObject(before.get())) {
        const Document after(cJSON_Parse(status.json), &cJSON_Delete);
        require(cJSON_IsObject(after.get()), "an object stays an object");
        const std::size_t added = count(model.members());
        require(count(after->child) == count(before->child) + added, "members are only added");
        require(sameMembers(lastMembers(after.get(), added), model.members()),
                "the members read back as they were written");
    }
    zeerr::release(status);
    return 0;
}
