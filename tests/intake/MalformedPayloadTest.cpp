#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "intake/IntakeFixture.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

namespace quorl::test {
namespace {

/// The class that decodes a row's metrics: its own, or the fixed one of an edge case; null for none.
std::unique_ptr<MetricCodable> messageOf(const MetricGroupV2& row) {
  if (row.zelkorId == 806743) return makeMessage("CellularLteConnectionStats");
  if (row.zelkorId == 827746) return makeMessage("CellularRatLacSrvInfo");
  return makeMessage(row.className);
}

/// A payload that holds every field of a class, children included.
Payload fullPayload(const MessageTable& table) {
  Payload payload;
  for (const FieldEntry& field : table.fields) {
    switch (field.kind) {
      case FieldKind::UInt64:
        payload.number(field.tag, 1700000000123);
        break;
      case FieldKind::UInt32:
        payload.number(field.tag, field.key == "subs_id" ? 1 : 300);
        break;
      case FieldKind::Bool:
      case FieldKind::Enumeration:
        payload.number(field.tag, 1);
        break;
      case FieldKind::Int32:
        payload.plainNumber(field.tag, -92);
        break;
      case FieldKind::SInt32:
        payload.signedNumber(field.tag, -9250);
        break;
      case FieldKind::Bytes:
      case FieldKind::String:
        payload.bytes(field.tag, "bytes");
        break;
      case FieldKind::Message:
        payload.message(field.tag, fullPayload(*field.message));
        break;
      case FieldKind::RepeatedMessage:
        payload.message(field.tag, fullPayload(*field.message)).message(field.tag, fullPayload(*field.message));
        break;
      case FieldKind::RepeatedUInt32:
      case FieldKind::RepeatedUInt64:
      case FieldKind::RepeatedSInt32:
        payload.number(field.tag, 7).bytes(field.tag, "\x07\x09");
        break;
    }
  }
  return payload;
}

bool hasSubscriptionId(const MetricCodable& message) {
  const auto fields = message.table().fields;
  return std::any_of(fields.begin(), fields.end(), [](const FieldEntry& field) { return field.key == "subs_id"; });
}

enum class Reading { Whole, Failed };

/// Whether a class reads `payload` whole.
Reading readingOf(const MetricGroupV2& row, const Payload& payload) {
  const auto message = messageOf(row);
  message->initWithData(ByteString(payload.data()));
  return message->isReadWhole() ? Reading::Whole : Reading::Failed;
}

struct Device {
  const char* name;
  const char* chipset;
};

void PrintTo(const Device& device, std::ostream* out) {
  *out << device.name;
}

class MalformedPayloadTest : public IntakeTest, public ::testing::WithParamInterface<Device> {
 protected:
  MalformedPayloadTest() {
    host.properties.texts["BasebandChipset"] = GetParam().chipset;
    serviceStarts();
  }

  /// Rows that share an id are decoded together, so each id is visited once.
  static std::vector<std::vector<const MetricGroupV2*>> rowsById() {
    std::vector<std::vector<const MetricGroupV2*>> groups;
    for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
      const auto found = std::find_if(groups.begin(), groups.end(),
                                      [&](const auto& group) { return group.front()->zelkorId == row.zelkorId; });
      if (found == groups.end()) {
        groups.push_back({&row});
      } else {
        found->push_back(&row);
      }
    }
    return groups;
  }

  static bool isEdgeCase(std::int64_t metricId) {
    const auto& ids = MetricService::exceptionMetricIds;
    return std::find(ids.begin(), ids.end(), metricId) != ids.end();
  }

  /// Sends a payload that no class of the id's rows reads whole, and expects the lines of that and no row.
  void expectDropped(const std::vector<const MetricGroupV2*>& catalogueRows, const Payload& payload) {
    const std::int64_t metricId = catalogueRows.front()->zelkorId;
    store.rows.clear();
    log.clear();
    service->metricsDidUpdate(metricMessage(metricId, payload));
    EXPECT_TRUE(store.rows.empty());
    std::vector<std::string> expected;
    if (isEdgeCase(metricId)) {
      expected.push_back("exception metric " + std::to_string(metricId));
    } else {
      expected.assign(catalogueRows.size(),
                      "MetricService - processMetric - exception - metricID " + std::to_string(metricId));
    }
    EXPECT_EQ(log.texts("metric-service"), expected);
  }

  /// Sends a payload of which nothing is known but that it must do no harm: each row writes all or nothing.
  void expectHarmless(const std::vector<const MetricGroupV2*>& catalogueRows, const Payload& payload) {
    const std::int64_t metricId = catalogueRows.front()->zelkorId;
    bool mayWrite = false;
    for (const MetricGroupV2* row : catalogueRows)
      mayWrite = mayWrite || (messageOf(*row) && readingOf(*row, payload) == Reading::Whole);
    if (!mayWrite) {
      expectDropped(catalogueRows, payload);
      return;
    }
    store.rows.clear();
    service->metricsDidUpdate(metricMessage(metricId, payload));
    for (const Metric& stored : store.rows) {
      const bool readWhole = std::any_of(catalogueRows.begin(), catalogueRows.end(), [&](const MetricGroupV2* row) {
        return row->name == stored.metricName && row->tech == stored.metricTech && messageOf(*row) &&
               readingOf(*row, payload) == Reading::Whole;
      });
      EXPECT_TRUE(readWhole) << stored.metricName << " wrote rows of a payload that it could not read whole";
    }
  }

  /// The next metric, of whatever id, is handled as if nothing had been.
  void expectNextMetricIsHandled() {
    store.rows.clear();
    service->metricsDidUpdate(metricMessage(806917, Payload().number(2, 2).number(15, 1)));
    EXPECT_EQ(rows(), (std::vector<std::string>{"state=2 INT", "subs_id=1 INT"}));
  }

  template <typename Check>
  void forEachId(Check check) {
    for (const auto& catalogueRows : rowsById()) {
      SCOPED_TRACE(catalogueRows.front()->zelkorId);
      check(catalogueRows);
      if (HasFailure()) return;
      expectNextMetricIsHandled();
    }
  }

  static bool hasClass(const std::vector<const MetricGroupV2*>& catalogueRows) {
    return messageOf(*catalogueRows.front()) != nullptr;
  }
};

TEST_P(MalformedPayloadTest, AFullPayloadGivesRowsIfItsClassHasASubscriptionId) {
  forEachId([&](const auto& catalogueRows) {
    if (!hasClass(catalogueRows)) return;
    store.rows.clear();
    service->metricsDidUpdate(
        metricMessage(catalogueRows.front()->zelkorId, fullPayload(messageOf(*catalogueRows.front())->table())));
    EXPECT_EQ(store.rows.empty(), !hasSubscriptionId(*messageOf(*catalogueRows.front())));
    for (const Metric& row : store.rows) {
      EXPECT_FALSE(row.attributeValue.empty());
      EXPECT_FALSE(row.attributeName.empty());
      EXPECT_EQ(row.subsId, 1);
    }
  });
}

TEST_P(MalformedPayloadTest, APayloadCutOffAtAnyByteIsReadWholeOrDropped) {
  forEachId([&](const auto& catalogueRows) {
    if (!hasClass(catalogueRows)) return;
    const std::string whole = fullPayload(messageOf(*catalogueRows.front())->table()).data();
    for (std::size_t length = 0; length < whole.size(); ++length) {
      SCOPED_TRACE(length);
      expectHarmless(catalogueRows, Payload().raw(std::string_view(whole).substr(0, length)));
      if (HasFailure()) return;
    }
  });
}

TEST_P(MalformedPayloadTest, APayloadWithoutItsLastByteIsDropped) {
  forEachId([&](const auto& catalogueRows) {
    if (!hasClass(catalogueRows)) return;
    Payload payload = fullPayload(messageOf(*catalogueRows.front())->table());
    payload.bytes(1000, "the last field");
    std::string cut = payload.data();
    cut.pop_back();
    expectDropped(catalogueRows, Payload().raw(cut));
  });
}

TEST_P(MalformedPayloadTest, AWireTypeThatDoesNotExistIsDropped) {
  forEachId([&](const auto& catalogueRows) {
    for (const std::uint32_t wireType : {6U, 7U}) {
      Payload payload;
      if (hasClass(catalogueRows)) payload = fullPayload(messageOf(*catalogueRows.front())->table());
      expectDropped(catalogueRows, payload.key(1000, wireType).number(1001, 1));
    }
  });
}

TEST_P(MalformedPayloadTest, ALengthBeyondTheEndIsDropped) {
  forEachId([&](const auto& catalogueRows) {
    for (const std::uint64_t length : {std::uint64_t{6}, std::uint64_t{1} << 31, std::uint64_t{1} << 32,
                                       std::uint64_t{1} << 63, ~std::uint64_t{0}}) {
      SCOPED_TRACE(length);
      expectDropped(catalogueRows, Payload().number(1, 5).key(1000, 2).varint(length).raw("short"));
    }
  });
}

TEST_P(MalformedPayloadTest, ALengthBeyondTheEndInAnyFieldIsDropped) {
  forEachId([&](const auto& catalogueRows) {
    if (!hasClass(catalogueRows)) return;
    for (const FieldEntry& field : messageOf(*catalogueRows.front())->table().fields) {
      SCOPED_TRACE(field.key);
      expectHarmless(catalogueRows, Payload().number(1, 5).key(field.tag, 2).varint(1000).raw("short"));
      expectHarmless(catalogueRows, Payload().number(1, 5).key(field.tag, 2).varint(~std::uint64_t{0}).raw("short"));
    }
  });
}

TEST_P(MalformedPayloadTest, AnyWireTypeInAnyFieldDoesNoHarm) {
  forEachId([&](const auto& catalogueRows) {
    if (!hasClass(catalogueRows)) return;
    for (const FieldEntry& field : messageOf(*catalogueRows.front())->table().fields) {
      for (std::uint32_t wireType = 0; wireType < 8; ++wireType) {
        SCOPED_TRACE(wireType);
        expectHarmless(catalogueRows,
                       Payload().number(1, 5).key(field.tag, wireType).raw("\x05\x08\x01\x10\x02\xFF\xFF\xFF"));
      }
    }
  });
}

TEST_P(MalformedPayloadTest, GroupsNestedTooDeepAreDroppedAndShallowOnesSkipped) {
  const auto nested = [](int depth) {
    Payload payload;
    payload.number(1, 5);
    for (int i = 0; i < depth; ++i) payload.key(1000, 3);
    for (int i = 0; i < depth; ++i) payload.key(1000, 4);
    return payload;
  };
  forEachId([&](const auto& catalogueRows) {
    expectHarmless(catalogueRows, nested(50));
    expectDropped(catalogueRows, nested(100000));
    if (hasClass(catalogueRows)) {
      EXPECT_EQ(readingOf(*catalogueRows.front(), nested(50)), Reading::Whole);
    }
  });
}

TEST_P(MalformedPayloadTest, AnUnfinishedGroupIsDropped) {
  forEachId([&](const auto& catalogueRows) {
    expectDropped(catalogueRows, Payload().number(1, 5).key(1000, 3).number(1, 1));
  });
}

TEST_P(MalformedPayloadTest, ANumberThatNeverEndsIsDropped) {
  forEachId([&](const auto& catalogueRows) {
    expectDropped(catalogueRows, Payload().number(1, 5).key(1000, 0).raw("\xFF\xFF\xFF"));
    expectDropped(catalogueRows, Payload().number(1, 5).raw("\xFF"));
  });
}

TEST_P(MalformedPayloadTest, AnyRunOfOneByteDoesNoHarm) {
  forEachId([&](const auto& catalogueRows) {
    for (int byte = 0; byte < 256; ++byte) {
      SCOPED_TRACE(byte);
      expectHarmless(catalogueRows, Payload().raw(std::string(64, static_cast<char>(byte))));
      if (HasFailure()) return;
    }
  });
}

TEST_P(MalformedPayloadTest, AnyByteOfAFullPayloadMayBeBroken) {
  forEachId([&](const auto& catalogueRows) {
    if (!hasClass(catalogueRows)) return;
    const std::string whole = fullPayload(messageOf(*catalogueRows.front())->table()).data();
    for (std::size_t at = 0; at < whole.size(); ++at) {
      for (const unsigned bits : {0xFFU, 0x80U, 0x01U}) {
        std::string broken = whole;
        broken[at] = static_cast<char>(static_cast<unsigned char>(broken[at]) ^ bits);
        SCOPED_TRACE(at);
        expectHarmless(catalogueRows, Payload().raw(broken));
        if (HasFailure()) return;
      }
    }
  });
}

INSTANTIATE_TEST_SUITE_P(Devices, MalformedPayloadTest,
                         ::testing::Values(Device{"Mav", "mav20"}, Device{"Ice", "ice7"}),
                         [](const auto& parameter) { return std::string(parameter.param.name); });

}  // namespace
}  // namespace quorl::test
